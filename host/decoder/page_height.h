// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <poppler.h>

namespace vaelo {

/// In points.
inline double heightOf(PopplerPage* page) {
  double height = 0;
  poppler_page_get_size(page, nullptr, &height);
  return height;
}

}  // namespace vaelo
