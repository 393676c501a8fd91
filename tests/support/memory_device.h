// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include "platform/ui/device.h"

namespace vaelo {

/// A phone, until a test says otherwise.
class MemoryDevice : public Device {
 public:
  InterfaceIdiom idiom = InterfaceIdiom::Phone;
  Screen screen{{0, 0, 360, 720}, 2};
  Rect statusBar;
  InterfaceOrientation orientation = InterfaceOrientation::Portrait;

  InterfaceIdiom userInterfaceIdiom() override { return idiom; }
  Screen mainScreen() override { return screen; }
  Rect statusBarFrame() override { return statusBar; }
  InterfaceOrientation statusBarOrientation() override { return orientation; }

  /// What a screen that fills the device has: both ways regular on a tablet, compact across on an upright phone.
  TraitCollection traits() const {
    const bool isWide = screen.bounds.width > screen.bounds.height;
    TraitCollection result;
    result.idiom = idiom;
    result.displayScale = screen.scale;
    const bool isPhone = idiom == InterfaceIdiom::Phone;
    result.horizontalSizeClass = isPhone ? SizeClass::Compact : SizeClass::Regular;
    result.verticalSizeClass = isPhone && isWide ? SizeClass::Compact : SizeClass::Regular;
    return result;
  }
};

}  // namespace vaelo
