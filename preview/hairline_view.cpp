// SPDX-License-Identifier: GPL-3.0-or-later
#include "preview/hairline_view.h"

#include "platform/platform.h"
#include "platform/ui/screen_factory.h"

namespace vaelo {

std::shared_ptr<HairlineView> HairlineView::init() {
  const auto line = std::make_shared<HairlineView>();
  line->setBackgroundColor(Color::barHairlineShadow());
  line->setContentCompressionResistancePriority(LayoutPriority::Required, LayoutAxis::Vertical);
  line->setTranslatesAutoresizingMaskIntoConstraints(false);
  LayoutConstraint::makeConstant(*line, LayoutAttribute::Height, _hairlineThicknessInPoints())->setActive(true);
  return line;
}

double HairlineView::_hairlineThicknessInPoints() { return 1 / Platform::current().screens.device().mainScreen().scale; }

}  // namespace vaelo
