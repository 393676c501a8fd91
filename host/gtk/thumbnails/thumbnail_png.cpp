// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/gtk/thumbnails/thumbnail_png.h"

#include <cstdint>

#include "host/gtk/thumbnails/thumbnail_cache.h"

namespace vaelo {

namespace {

constexpr std::size_t ChunkFrame = 12;  // bytes around what a chunk holds: its length, its name, its check sum

std::uint32_t bigEndian(std::string_view bytes, std::size_t at) {
  std::uint32_t value = 0;
  for (const char byte : bytes.substr(at, 4)) value = value << 8 | static_cast<unsigned char>(byte);
  return value;
}

bool isSide(std::uint32_t side) { return side >= 1 && side <= LargestThumbnail; }

/// A text chunk is a key and a value with a zero between them.
void readText(std::string_view text, ThumbnailPng& png) {
  const std::size_t zero = text.find('\0');
  if (zero == std::string_view::npos) return;
  const std::string_view key = text.substr(0, zero);
  if (key == "Thumb::URI") png.uri = text.substr(zero + 1);
  if (key == "Thumb::MTime") png.modified = text.substr(zero + 1);
}

}  // namespace

std::optional<ThumbnailPng> thumbnailPng(std::string_view bytes) {
  constexpr std::string_view signature("\x89PNG\r\n\x1a\n", 8);
  constexpr std::string_view header("\0\0\0\rIHDR", 8);
  constexpr std::string_view end("\0\0\0\0IEND\xae\x42\x60\x82", ChunkFrame);
  const std::size_t first = signature.size();
  if (!bytes.starts_with(signature) || !bytes.ends_with(end) || !bytes.substr(first).starts_with(header))
    return std::nullopt;
  if (bytes.size() < first + ChunkFrame + 13) return std::nullopt;
  const std::uint32_t width = bigEndian(bytes, first + header.size());
  const std::uint32_t height = bigEndian(bytes, first + header.size() + 4);
  if (!isSide(width) || !isSide(height)) return std::nullopt;
  ThumbnailPng png{static_cast<int>(width), static_cast<int>(height), {}, {}};
  for (std::string_view rest = bytes.substr(first); rest.size() >= ChunkFrame;) {
    const std::size_t length = bigEndian(rest, 0);
    if (length > rest.size() - ChunkFrame) return std::nullopt;
    if (rest.substr(4, 4) == "tEXt") readText(rest.substr(8, length), png);
    rest.remove_prefix(ChunkFrame + length);
  }
  return png;
}

}  // namespace vaelo
