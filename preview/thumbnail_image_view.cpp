// SPDX-License-Identifier: GPL-3.0-or-later
#include "preview/thumbnail_image_view.h"

#include <algorithm>
#include <limits>

#include "items/dr_item.h"
#include "platform/platform.h"
#include "platform/ui/screen_factory.h"

namespace vaelo {

namespace {

constexpr double Epsilon = std::numeric_limits<float>::epsilon();  // points
constexpr double LargestMagnification = 8;
constexpr double IconMagnification = 2;
constexpr double MarginOnLargeScreens = 45;
constexpr double Margin = 17;
constexpr double BorderOpacity = 0.16;

}  // namespace

std::shared_ptr<ThumbnailImageView> ThumbnailImageView::initWithFrame(const Rect& frame) {
  const auto view = std::make_shared<ThumbnailImageView>(frame);
  view->thumbnailView_ = std::make_shared<ImageView>();
  view->thumbnailView_->setContentMode(ContentMode::TopLeft);
  // A small thumbnail stays crisp when it is enlarged.
  view->thumbnailView_->setMagnificationFilter(MagnificationFilter::Nearest);
  view->thumbnailView_->setAccessibilityLabel(Platform::current().formatting.localizedString("Thumbnail"));
  view->addSubview(view->thumbnailView_);
  return view;
}

void ThumbnailImageView::setItem(const std::shared_ptr<DRItem>& item) {
  item_ = item;
  if (!item_) return;
  const ImageRef thumbnail = item_->thumbnail();
  if (thumbnail && thumbnail->height() >= Epsilon) {
    isGenericImage_ = false;
    _setThumbnailImageWantsBorder(thumbnail, true);
    return;
  }
  isGenericImage_ = true;
  showGenericImage();
}

void ThumbnailImageView::showGenericImage() {
  const std::string name = item_ && item_->resolvedURL() ? item_->resolvedURL()->lastPathComponent() : "";
  _setThumbnailImageWantsBorder(Platform::current().screens.graphics().documentIcon(
                                    name, item_ ? item_->typeIdentifier() : std::nullopt, IconFormat::Large),
                                false);
}

void ThumbnailImageView::_setThumbnailImageWantsBorder(const ImageRef& image, bool wantsBorder) {
  thumbnailView_->setImage(image);
  thumbnailView_->setBorder(wantsBorder ? 1 : 0, Color::black().withAlpha(BorderOpacity));
  setNeedsLayout();
}

double ThumbnailImageView::margins() const {
  const TraitCollection traits = traitCollection();
  const bool large = traits.horizontalSizeClass == SizeClass::Regular && traits.verticalSizeClass == SizeClass::Regular;
  return large ? MarginOnLargeScreens : Margin;
}

Rect ThumbnailImageView::aspectFitImageInRectWithMargins(const Size& image, const Rect& rect, double margin) const {
  const Rect inner = rect.insetBy(margin, margin);
  double scale = 0;
  if (image.width >= Epsilon && image.height >= Epsilon) {
    scale = std::min(inner.width / image.width, inner.height / image.height);
  }
  scale = isGenericImage_ ? IconMagnification : std::min(scale, LargestMagnification);
  const double width = image.width * scale;
  const double height = image.height * scale;
  return {rect.x + (rect.width - width) / 2, rect.y + (rect.height - height) / 2, width, height};
}

void ThumbnailImageView::layoutSubviews() {
  View::layoutSubviews();
  const ImageRef& image = thumbnailView_->image();
  if (!image) return;
  const Rect room = {0, 0, frame().width, frame().height};
  thumbnailView_->setFrame(aspectFitImageInRectWithMargins({image->width(), image->height()}, room, margins()));
}

}  // namespace vaelo
