// SPDX-License-Identifier: GPL-3.0-or-later
#include "preview/constraint_utils.h"

namespace vaelo {

std::vector<LayoutConstraintRef> ConstraintUtils::verticallyStackedConstraintsInParentTopChildBottomChildMiddleGap(
    View& parent, View& topChild, View& bottomChild, double middleGap) {
  using enum LayoutAttribute;
  std::vector<LayoutConstraintRef> made;
  for (View* child : {&topChild, &bottomChild}) {
    made.push_back(LayoutConstraint::makeEqual(*child, CenterX, parent, CenterX));
    made.push_back(LayoutConstraint::make(*child, Width, LayoutRelation::LessThanOrEqual, &parent, Width));
  }
  made.push_back(LayoutConstraint::makeEqual(parent, Top, topChild, Top));
  made.push_back(LayoutConstraint::makeEqual(bottomChild, Top, topChild, Bottom, middleGap));
  made.push_back(LayoutConstraint::makeEqual(bottomChild, Bottom, parent, Bottom));
  return made;
}

std::vector<LayoutConstraintRef> ConstraintUtils::stretchSubviewConstraintsWithinView(View& subview, View& view) {
  std::vector<LayoutConstraintRef> made;
  for (const LayoutAttribute edge :
       {LayoutAttribute::Top, LayoutAttribute::Bottom, LayoutAttribute::CenterX, LayoutAttribute::Leading}) {
    made.push_back(LayoutConstraint::makeEqual(subview, edge, view, edge));
  }
  return made;
}

}  // namespace vaelo
