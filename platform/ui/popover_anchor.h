// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <memory>

#include "platform/ui/bar_button_item.h"
#include "platform/ui/geometry.h"

namespace vaelo {

enum ArrowDirections : unsigned { ArrowUp = 1, ArrowDown = 2, ArrowLeft = 4, ArrowRight = 8, ArrowAny = 15 };

/// Where a popover points to: a rectangle of a view, or a bar button. With neither, the presented screen is centred.
struct PopoverAnchor {
  std::weak_ptr<View> sourceView;
  Rect sourceRect;
  unsigned permittedArrowDirections = ArrowAny;
  BarButtonItemRef barButtonItem;
};

}  // namespace vaelo
