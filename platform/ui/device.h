// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include "platform/ui/geometry.h"
#include "platform/ui/trait_collection.h"

namespace vaelo {

struct Screen {
  Rect bounds;
  /// Physical pixels in a point.
  double scale = 1;
};

enum class InterfaceOrientation { Unknown = 0, Portrait = 1, PortraitUpsideDown = 2, LandscapeRight = 3, LandscapeLeft = 4 };

/// The device that the application is shown on. Main thread.
class Device {
 public:
  virtual ~Device() = default;
  virtual InterfaceIdiom userInterfaceIdiom() = 0;
  virtual Screen mainScreen() = 0;
  /// Empty where the system shows no status bar in our window.
  virtual Rect statusBarFrame() = 0;
  virtual InterfaceOrientation statusBarOrientation() = 0;
};

}  // namespace vaelo
