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
/// The same as long as `goOn`, which is asked before each entry, answers true. Our own folders that keep their owner out are
/// opened up first. Answers 0 or the error number, ECANCELED when it was told to end.
int removeTreeWhile(const std::string& path, const std::function<bool()>& goOn);
/// How many entries there are at and below `path`, as far as they can be read; ends early when `goOn` answers false.
std::size_t countTree(const std::string& path, const std::function<bool()>& goOn);

}  // namespace vaelo
