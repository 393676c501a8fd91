// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <librsvg/rsvg.h>

#include <cstddef>

#include "host/decoder/picture_source.h"
#include "host/support/glib_ptr.h"

namespace vaelo {

/// A picture made of shapes. It may refer to nothing outside of itself: it is read without an address that such a reference
/// could be relative to, which the library takes as "load nothing".
class PictureVector : public PictureSource {
 public:
  PictureVector(const unsigned char* file, std::size_t size) : file_(file), bytes_(size) {}
  /// True when it looks like one.
  static bool isOne(const unsigned char* file, std::size_t size);
  const char* open(PictureSize bounds) override;
  PictureSize size() const override { return size_; }
  Features features() const override;
  const char* draw(const PicturePart& part, PictureSize to, std::uint32_t* pixels) override;

 private:
  const unsigned char* file_;
  std::size_t bytes_;
  GRef<RsvgHandle> handle_;
  PictureSize size_;
};

}  // namespace vaelo
