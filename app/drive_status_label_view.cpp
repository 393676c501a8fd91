// SPDX-License-Identifier: GPL-3.0-or-later
#include "app/drive_status_label_view.h"

#include <algorithm>
#include <cmath>

#include "platform/platform.h"
#include "platform/ui/screen_factory.h"

namespace vaelo {

namespace {

constexpr double GapShare = 0.25;  // of the label's height
constexpr double Raise = 1;        // points; a toolbar's optical middle is above its middle

/// To the nearest physical pixel.
double onPixel(double points) {
  const double scale = Platform::current().screens.device().mainScreen().scale;
  return std::round(points * scale) / scale;
}

}  // namespace

std::shared_ptr<DriveStatusLabelView> DriveStatusLabelView::initWithFrame(const Rect& frame) {
  const auto view = std::make_shared<DriveStatusLabelView>(frame);
  view->setAutoresizingMask(FlexibleWidth | FlexibleHeight);
  view->setOpaque(false);
  view->showLowQuota(false);
  return view;
}

void DriveStatusLabelView::setPrimaryLabel(std::shared_ptr<Label> label) {
  primaryLabel_ = std::move(label);
  addSubview(primaryLabel_);
}

void DriveStatusLabelView::setQuotaButton(std::shared_ptr<UpgradeButton> button) {
  quotaButton_ = std::move(button);
  addSubview(quotaButton_);
}

void DriveStatusLabelView::setPrimaryLabelText(const std::string& text) {
  primaryLabel_->setText(text);
  primaryLabel_->sizeToFit();
  setNeedsLayout();
}

void DriveStatusLabelView::showLowQuota(bool show) {
  showLowQuota_ = show;
  if (quotaButton_) quotaButton_->setHidden(!show);
  setNeedsLayout();
}

void DriveStatusLabelView::layoutSubviews() {
  if (!primaryLabel_ || !quotaButton_) return;
  primaryLabel_->sizeToFit();
  quotaButton_->sizeToFit();
  quotaButton_->layoutIfNeeded();
  const Size view = frame().size();
  const Size label = primaryLabel_->frame().size();
  Size button = quotaButton_->frame().size();
  double titleHeight = quotaButton_->titleLabel()->frame().height;
  if (titleHeight < 1) titleHeight = label.height;
  if (button.height < 1) button = label;
  const double inset = (button.height - titleHeight) * 0.5;
  const double labelBlock = primaryLabel_->text().empty() ? 0 : label.height;
  const double gap = showLowQuota_ ? label.height * GapShare : 0;
  const double total = showLowQuota_ ? gap + titleHeight + labelBlock : labelBlock;
  const Rect placed = {onPixel((view.width - label.width) * 0.5), onPixel((view.height - total) * 0.5 - Raise), label.width,
                       label.height};
  primaryLabel_->setFrame(placed);
  quotaButton_->setFrame(
      {onPixel((view.width - button.width) * 0.5), onPixel(gap + placed.maxY() - inset), button.width, button.height});
}

Size DriveStatusLabelView::intrinsicContentSize() const {
  if (!primaryLabel_ || !quotaButton_) return View::intrinsicContentSize();
  const Size label = primaryLabel_->intrinsicContentSize();
  if (!showLowQuota_) return {label.width, label.height + 2 * Raise};
  const Size button = quotaButton_->intrinsicContentSize();
  return {std::max(label.width, button.width), label.height * (1 + GapShare) + button.height + 2 * Raise};
}

}  // namespace vaelo
