// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <memory>

#include "platform/ui/image_view.h"

namespace vaelo {

class DRItem;

/// An item's thumbnail, or else its document icon, as large as there is room for. Main thread.
class ThumbnailImageView : public View {
 public:
  static std::shared_ptr<ThumbnailImageView> initWithFrame(const Rect& frame);
  explicit ThumbnailImageView(const Rect& frame) : View(frame) {}

  const std::shared_ptr<DRItem>& item() const { return item_; }
  /// Null keeps what is shown.
  void setItem(const std::shared_ptr<DRItem>& item);
  const std::shared_ptr<ImageView>& thumbnailView() const { return thumbnailView_; }
  /// It shows the document icon.
  bool isGenericImage() const { return isGenericImage_; }
  void showGenericImage();
  void _setThumbnailImageWantsBorder(const ImageRef& image, bool wantsBorder);
  /// Points around the image.
  double margins() const;
  /// Where an image of that size stands in the rectangle.
  Rect aspectFitImageInRectWithMargins(const Size& image, const Rect& rect, double margin) const;
  void layoutSubviews() override;

 private:
  std::shared_ptr<DRItem> item_;
  std::shared_ptr<ImageView> thumbnailView_;
  bool isGenericImage_ = false;
};

}  // namespace vaelo
