// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <vector>

#include "platform/ui/layout_constraint.h"
#include "platform/ui/view.h"

namespace vaelo {

/// Sets of constraints that screens need again and again; none is active yet. Main thread.
class ConstraintUtils {
 public:
  /// One child above the other, `middleGap` points apart, centred and no wider than the parent, which is as high as both.
  static std::vector<LayoutConstraintRef> verticallyStackedConstraintsInParentTopChildBottomChildMiddleGap(View& parent,
                                                                                                           View& topChild,
                                                                                                           View& bottomChild,
                                                                                                           double middleGap);
  /// The subview has the view's top, bottom, centre and leading edge.
  static std::vector<LayoutConstraintRef> stretchSubviewConstraintsWithinView(View& subview, View& view);
};

}  // namespace vaelo
