// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/decoder/picture_orientation.h"

#include <cstring>
#include <string_view>

namespace vaelo {

namespace {

/// Bytes that are read with care: behind the end are zeroes.
class Reader {
 public:
  Reader(const unsigned char* data, std::size_t size) : data_(data), size_(size) {}

  std::size_t size() const { return size_; }
  bool has(std::size_t at, std::string_view text) const {
    return at <= size_ && size_ - at >= text.size() && std::memcmp(data_ + at, text.data(), text.size()) == 0;
  }
  std::uint32_t big(std::size_t at, std::size_t count) const {
    std::uint32_t value = 0;
    for (std::size_t i = 0; i < count; ++i) value = value << 8 | byte(at + i);
    return value;
  }
  std::uint32_t little(std::size_t at, std::size_t count) const {
    std::uint32_t value = 0;
    for (std::size_t i = count; i-- > 0;) value = value << 8 | byte(at + i);
    return value;
  }
  Reader from(std::size_t at, std::size_t count) const {
    if (at > size_) return {data_, 0};
    return {data_ + at, std::min(count, size_ - at)};
  }

 private:
  std::uint32_t byte(std::size_t at) const { return at < size_ ? data_[at] : 0U; }
  const unsigned char* data_;
  std::size_t size_;
};

int inNotes(const Reader& notes) {
  constexpr std::uint32_t orientationTag = 0x112;
  const bool isLittle = notes.has(0, "II");
  if (!isLittle && !notes.has(0, "MM")) return 1;
  const auto number = [&](std::size_t at, std::size_t count) {
    return isLittle ? notes.little(at, count) : notes.big(at, count);
  };
  const std::size_t directory = number(4, 4);
  const std::size_t entries = number(directory, 2);
  for (std::size_t i = 0; i < entries; ++i) {
    const std::size_t entry = directory + 2 + 12 * i;
    if (entry + 12 > notes.size()) break;
    if (number(entry, 2) != orientationTag) continue;
    const std::uint32_t value = number(entry + 8, 2);
    return value >= 1 && value <= 8 ? static_cast<int>(value) : 1;
  }
  return 1;
}

/// The markers before the pixels of a JPEG file.
struct JpegHead {
  int orientation = 1;
  std::size_t pixels = 0;  // where they begin; 0 when they don't
};

JpegHead readJpegHead(const Reader& file) {
  constexpr std::string_view mark("Exif\0\0", 6);
  JpegHead head;
  for (std::size_t at = 2; at + 4 <= file.size() && file.big(at, 1) == 0xFF;) {
    const std::uint32_t kind = file.big(at + 1, 1);
    if (kind == 0xFF) {  // padding
      ++at;
      continue;
    }
    if (kind == 0xDA) head.pixels = at;
    if (kind == 0xDA || kind == 0xD9) break;
    const std::size_t length = file.big(at + 2, 2);
    if (kind == 0xE1 && file.has(at + 4, mark)) head.orientation = inNotes(file.from(at + 10, length));
    at += 2 + length;
  }
  return head;
}

int inPng(const Reader& file) {
  for (std::size_t at = 8; at + 12 <= file.size();) {
    const std::size_t length = file.big(at, 4);
    if (file.has(at + 4, "eXIf")) return inNotes(file.from(at + 8, length));
    if (file.has(at + 4, "IEND")) break;
    at += 12 + length;
  }
  return 1;
}

int inWebp(const Reader& file) {
  constexpr std::string_view mark("Exif\0\0", 6);
  for (std::size_t at = 12; at + 8 <= file.size();) {
    const std::size_t length = file.little(at + 4, 4);
    if (file.has(at, "EXIF")) return inNotes(file.from(at + (file.has(at + 8, mark) ? 14 : 8), length));
    at += 8 + length + length % 2;
  }
  return 1;
}

}  // namespace

int pictureOrientation(const unsigned char* data, std::size_t size) {
  const Reader file(data, size);
  if (file.has(0, "\xFF\xD8\xFF")) return readJpegHead(file).orientation;
  if (file.has(0, "\x89PNG\r\n\x1A\n")) return inPng(file);
  if (file.has(0, "RIFF") && file.has(8, "WEBP")) return inWebp(file);
  return 1;
}

bool isCutJpeg(const unsigned char* data, std::size_t size) {
  const Reader file(data, size);
  const std::size_t pixels = readJpegHead(file).pixels;
  // What some cameras write behind the end doesn't matter.
  std::size_t at = size;
  while (pixels != 0 && at > pixels && !file.has(at, "\xFF\xD9")) --at;
  return at == pixels;
}

PicturePart partBeforeTurn(int orientation, PictureSize shown, const PicturePart& part) {
  const double right = shown.width - part.x - part.width;
  const double bottom = shown.height - part.y - part.height;
  switch (orientation) {
    case 2:
      return {right, part.y, part.width, part.height};
    case 3:
      return {right, bottom, part.width, part.height};
    case 4:
      return {part.x, bottom, part.width, part.height};
    case 5:
      return {part.y, part.x, part.height, part.width};
    case 6:
      return {part.y, right, part.height, part.width};
    case 7:
      return {bottom, right, part.height, part.width};
    case 8:
      return {bottom, part.x, part.height, part.width};
    default:
      return part;
  }
}

void turnPicture(int orientation, const std::uint32_t* from, PictureSize size, std::uint32_t* to) {
  const std::ptrdiff_t width = size.width;
  const std::ptrdiff_t height = size.height;
  // Where the first pixel goes, and how far a step to the right and down is there.
  struct Steps {
    std::ptrdiff_t start, right, down;
  };
  const Steps steps[] = {
      {0, 1, width},  {width - 1, -1, width},   {width * height - 1, -1, -width},  {width * (height - 1), 1, -width},
      {0, height, 1}, {height - 1, height, -1}, {width * height - 1, -height, -1}, {height * (width - 1), -height, 1}};
  const Steps& turn = steps[orientation >= 1 && orientation <= 8 ? orientation - 1 : 0];
  for (std::ptrdiff_t y = 0; y < height; ++y) {
    std::uint32_t* pixel = to + turn.start + y * turn.down;
    for (std::ptrdiff_t x = 0; x < width; ++x, pixel += turn.right) *pixel = *from++;
  }
}

}  // namespace vaelo
