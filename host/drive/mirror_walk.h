// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <sys/stat.h>

#include <functional>
#include <string>

namespace vaelo {

/// Visits everything below the mirror `root`, hidden files and the trash too, but not the folders that are being removed
/// (DriveLayout::Removing), parents first, until `visit` returns false. Links are not
/// followed; folders that can't be read are passed over. Paths are physical. Blocking; any thread.
void walkTree(const std::string& root, const std::function<bool(const std::string& path, const struct stat& status)>& visit);

}  // namespace vaelo
