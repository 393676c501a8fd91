// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <optional>
#include <string>
#include <vector>

#include "platform/result.h"

namespace vaelo {

/// What is kept in an item's extended attributes, and in its promise while it is not downloaded. Paths are physical: the
/// item itself or its promise; links are not followed. What is not there or has no such attribute has none. Safe from any
/// thread.

/// SharedItemRoleOwner or SharedItemRoleParticipant; nothing when the item is not shared or the attribute says neither.
std::optional<std::string> sharedItemRoleAt(const std::string& physical);
/// Whether a person is to see the item's name without its extension.
bool extensionIsHiddenAt(const std::string& physical);
/// Tag names in the order in which they are kept, trimmed, without empty and repeated ones and what is not UTF-8.
std::vector<std::string> tagNamesAt(const std::string& physical);

/// Where tags are kept, as file managers of the free desktop read and write them: names with commas between.
inline constexpr const char* TagsAttribute = "user.xdg.tags";
inline constexpr std::size_t LongestTagName = 100;  // characters

/// Whether a person may give a tag this name: text on one line, without commas and blanks at its ends.
bool isTagName(const std::string& name);
/// Puts a tag on an item or takes it off; the others stay as they are. Error 514 for a name that is none, else those of
/// FileManager; 512 where the file system keeps no tags. Blocks.
std::optional<Error> setTagAt(const std::string& physical, const std::string& name, bool on);

}  // namespace vaelo
