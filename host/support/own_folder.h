// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <string>

namespace vaelo {

/// The first folder with the application's own `file` in it, or empty: `name` below the folder of the program where it is
/// built, one up for its tests; where it is installed `installedName` below the prefix, wherever that was moved to. Any
/// thread.
std::string ownFolder(const std::string& name, const std::string& installedName, const std::string& file);

}  // namespace vaelo
