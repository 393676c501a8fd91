// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <optional>
#include <string>
#include <vector>

namespace vaelo {

/// What is kept in an item's extended attributes, and in its promise while it is not downloaded. Paths are physical: the
/// item itself or its promise; links are not followed. What is not there or has no such attribute has none. Safe from any
/// thread.

/// SharedItemRoleOwner or SharedItemRoleParticipant; nothing when the item is not shared or the attribute says neither.
std::optional<std::string> sharedItemRoleAt(const std::string& physical);
/// Tag names in the order in which they are kept, trimmed, without empty and repeated ones and what is not UTF-8.
std::vector<std::string> tagNamesAt(const std::string& physical);

}  // namespace vaelo
