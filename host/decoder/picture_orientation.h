// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <cstddef>
#include <cstdint>

#include "host/decoder/picture_source.h"

namespace vaelo {

/// How the camera was held, as its notes in a JPEG, PNG or WebP file say: 1 to 8, as EXIF numbers them; 1 without notes.
int pictureOrientation(const unsigned char* file, std::size_t size);

/// True when the file is a JPEG file that is cut off.
bool isCutJpeg(const unsigned char* file, std::size_t size);

/// True when it exchanges width and height.
inline bool turnsSideways(int orientation) { return orientation >= 5; }
/// Where the part is in a picture of the size `shown` before it is turned.
PicturePart partBeforeTurn(int orientation, PictureSize shown, const PicturePart& part);
/// Turns pixels; `size` is the one before the turn.
void turnPicture(int orientation, const std::uint32_t* from, PictureSize size, std::uint32_t* to);

}  // namespace vaelo
