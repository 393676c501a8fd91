// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <gdk-pixbuf/gdk-pixbuf.h>

#include <cstddef>

#include "host/decoder/picture_source.h"
#include "host/support/glib_ptr.h"

namespace vaelo {

/// A picture of pixels, in any form that the installed loaders know. A photograph is decoded at an eighth, a quarter or half
/// of its size when that is enough for what is drawn, which takes a fraction of the time and memory.
class PictureRaster : public PictureSource {
 public:
  PictureRaster(const unsigned char* file, std::size_t size);
  const char* open(PictureSize bounds) override;
  PictureSize size() const override;
  Features features() const override;
  const char* draw(const PicturePart& part, PictureSize to, std::uint32_t* pixels) override;
  void advance() override;

 private:
  struct Loading;
  const char* load(PictureSize wanted);
  const char* take(GdkPixbufLoader* loader);
  PictureSize decoded() const;

  const unsigned char* file_;
  std::size_t bytes_;
  bool isPhotograph_;  // of the kind that can be decoded smaller
  int orientation_;
  PictureSize stored_;  // before it is turned
  GRef<GdkPixbuf> pixbuf_;
  GRef<GdkPixbufAnimationIter> frames_;
  gint64 time_ = 0;  // of the animation, microseconds
  bool partial_ = false;
};

}  // namespace vaelo
