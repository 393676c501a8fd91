// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <functional>
#include <optional>
#include <string>

#include "platform/file_manager.h"

namespace vaelo {

/// Walks the tree below `url` as FileManager::enumerate says.
void enumerateTree(const URL& url, unsigned options, const std::function<bool(const URL&)>& visit,
                   const std::function<bool(const URL&, const Error&)>& onError);

/// Removes the item at `path` (as it stands on the disk) and everything below it; links are removed, not followed, also when
/// somebody puts one in place of a folder meanwhile.
std::optional<Error> removeTree(const std::string& path);

}  // namespace vaelo
