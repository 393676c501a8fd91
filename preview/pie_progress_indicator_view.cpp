// SPDX-License-Identifier: GPL-3.0-or-later
#include "preview/pie_progress_indicator_view.h"

#include <algorithm>
#include <cmath>
#include <numbers>

#include "platform/ui/graphics.h"

namespace vaelo {

namespace {

// Something always shows, and something is always missing.
constexpr double Sliver = 0.005;
constexpr double TwelveOClock = -std::numbers::pi / 2;

}  // namespace

PieProgressIndicatorView::PieProgressIndicatorView(const Rect& frame) : View(frame) { setBackgroundColor(Color::clear()); }

void PieProgressIndicatorView::setProgress(double progress) {
  progress_ = progress;
  setNeedsDisplay();
}

void PieProgressIndicatorView::drawRect(DrawingContext& context, const Rect&) {
  const double p = std::clamp(progress_, Sliver, 1 - Sliver);
  context.setFillColor(Color::lightGray());
  context.setStrokeColor(Color::lightGray());
  const Rect pie = bounds();
  context.fillWedge(pie.center(), std::ceil(pie.height / 2), TwelveOClock, TwelveOClock + p * 2 * std::numbers::pi);
  context.strokeEllipse(pie);
}

}  // namespace vaelo
