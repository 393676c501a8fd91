// SPDX-License-Identifier: GPL-3.0-or-later
#include "platform/ui/image_view.h"

#include <utility>

namespace vaelo {

void ImageView::setImage(ImageRef image) {
  if (image_ == image) return;
  image_ = std::move(image);
  notify(ViewChange::Content);
}

void ImageView::setContentMode(ContentMode mode) {
  if (contentMode_ == mode) return;
  contentMode_ = mode;
  notify(ViewChange::Appearance);
}

void ImageView::setMagnificationFilter(MagnificationFilter filter) {
  if (magnificationFilter_ == filter) return;
  magnificationFilter_ = filter;
  notify(ViewChange::Appearance);
}

Size ImageView::intrinsicContentSize() const {
  if (!image_) return {NoIntrinsicMetric, NoIntrinsicMetric};
  return {image_->width(), image_->height()};
}

}  // namespace vaelo
