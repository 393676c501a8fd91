// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <string>

namespace vaelo {

/// The media type of the item at the logical path. The name decides; where it doesn't, the first bytes of a regular file
/// do, but an item that is not downloaded is never read. A folder that is no package is "inode/directory". Blocks shortly;
/// any thread.
std::string contentTypeOf(const std::string& path);

}  // namespace vaelo
