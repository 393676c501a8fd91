// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <memory>

#include "platform/ui/view.h"

namespace vaelo {

/// A line as thin as the screen can draw. Main thread.
class HairlineView : public View {
 public:
  static std::shared_ptr<HairlineView> init();
  /// One physical pixel of the main screen.
  static double _hairlineThicknessInPoints();
};

}  // namespace vaelo
