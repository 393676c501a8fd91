// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <cstdint>

namespace vaelo {

struct PictureSize {
  int width = 0;
  int height = 0;
};

/// A part of a picture, in its pixels as they are shown.
struct PicturePart {
  double x = 0;
  double y = 0;
  double width = 0;
  double height = 0;
};

/// The largest size of the picture's shape within `bounds`, at least one pixel; larger than the picture only when it
/// `grows`.
PictureSize fitPicture(PictureSize picture, PictureSize bounds, bool grows);

/// A picture that can be drawn at any size. The bytes that it is made from stay where they are.
class PictureSource {
 public:
  struct Features {
    bool transparent = false;  ///< something behind it may show through
    bool scalable = false;     ///< made of shapes: sharp at any size
    bool partial = false;      ///< the end of it is missing
    int delay = -1;            ///< milliseconds until the next picture of an animation
  };

  virtual ~PictureSource() = default;
  /// Reads it, for pictures within `bounds` first. Null, or a word of DecoderError.
  virtual const char* open(PictureSize bounds) = 0;
  virtual PictureSize size() const = 0;
  virtual Features features() const = 0;
  /// Draws a part, which lies within the picture, to all of `pixels`: premultiplied BGRA, zeroes at first, rows
  /// `width` apart.
  virtual const char* draw(const PicturePart& part, PictureSize to, std::uint32_t* pixels) = 0;
  /// Goes on to the next picture of an animation.
  virtual void advance() {}
};

}  // namespace vaelo
