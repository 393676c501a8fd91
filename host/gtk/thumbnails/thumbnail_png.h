// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <optional>
#include <string>
#include <string_view>

namespace vaelo {

/// What a thumbnail's file says of itself before anything of it is decoded (PNG, and the keys of the Thumbnail Managing
/// Standard). A picture may claim to be larger than the memory, or be cut off, which decoders are content with.
struct ThumbnailPng {
  int width = 0;  ///< pixels
  int height = 0;
  std::optional<std::string> uri;       ///< Thumb::URI
  std::optional<std::string> modified;  ///< Thumb::MTime
};

/// Nothing unless `bytes` are a whole picture whose sides are those of thumbnails. Any thread.
std::optional<ThumbnailPng> thumbnailPng(std::string_view bytes);

}  // namespace vaelo
