// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <gdk/gdk.h>

#include <cstdint>
#include <string>

namespace vaelo {

/// The picture that the desktop's shared thumbnail cache (in `cacheFolder`, the user's) keeps of a file, at most `pixels`
/// wide and high; null when there is none or when it is of another version of the file (`modified`: the file's own time,
/// seconds since 1970). Owned by the caller. Looks up only: makes nothing, and never opens the file itself. Blocks; any
/// thread.
GdkTexture* cachedThumbnail(const std::string& cacheFolder, const std::string& path, std::int64_t modified, int pixels);

}  // namespace vaelo
