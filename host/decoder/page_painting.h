// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <poppler.h>

namespace vaelo {

/// A rectangle of a page's pixels at so many pixels a point.
struct PageTile {
  double scale = 1;
  int x = 0;
  int y = 0;
  int width = 0;
  int height = 0;
};

/// Paints it on white, in rows of width * 4 bytes (CAIRO_FORMAT_ARGB32). False when that failed.
bool paintPage(PopplerPage* page, const PageTile& tile, unsigned char* pixels);

}  // namespace vaelo
