// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <cstdint>

#include "host/decoder/picture_source.h"

namespace vaelo {

/// Pixels that are read a row at a time.
class PictureRows {
 public:
  virtual ~PictureRows() = default;
  virtual PictureSize size() const = 0;
  /// `count` pixels from (`x`, `y`) on, premultiplied BGRA; all of them are within the size.
  virtual void read(int x, int y, int count, std::uint32_t* pixels) const = 0;
};

/// Fills `pixels` with a part of the rows: made smaller by averaging, slightly larger smoothly, and from twice the size on
/// with sharp edges, since who looks that close wants to see pixels.
void scalePicture(const PictureRows& rows, const PicturePart& part, PictureSize to, std::uint32_t* pixels);

}  // namespace vaelo
