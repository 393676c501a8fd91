// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <chrono>
#include <string>
#include <vector>

#include "host/gtk/thumbnails/thumbnailers.h"

namespace vaelo {

/// How much a thumbnailer may use: a document of a stranger can make it run and fill the disk without end.
struct ThumbnailerLimits {
  std::chrono::milliseconds time{20000};
  std::size_t memory = std::size_t{2} << 30;  ///< bytes of address space
};

/// Has a thumbnailer make the thumbnail of a file, at least `pixels` a side where the document is as large, and puts it into
/// the cache. True when there is one then. What can't be made is remembered, so that the same version of the file is not
/// tried again; a file that changes meanwhile is not. Blocks for as long as the limits say; any thread but the main one.
bool makeThumbnail(const Thumbnailers& thumbnailers, const std::string& cacheFolder, const std::string& path, int pixels,
                   const ThumbnailerLimits& limits = {});

/// Whether makeThumbnail may bring something: there is a thumbnailer for the type, and it has not failed before.
bool mayHaveThumbnail(const Thumbnailers& thumbnailers, const std::string& cacheFolder, const std::string& path,
                      std::int64_t modified);

/// Runs a program in a process group of its own, without input and output, and kills the group when the time is over. True
/// when it ended well.
bool runBounded(const std::vector<std::string>& command, const ThumbnailerLimits& limits);

}  // namespace vaelo
