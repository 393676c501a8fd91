// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include "platform/image.h"
#include "platform/ui/view.h"

namespace vaelo {

enum class ContentMode { ScaleToFill, ScaleAspectFit, ScaleAspectFill, Center, TopLeft };
enum class MagnificationFilter { Linear, Nearest };

/// A picture. Main thread.
class ImageView : public View {
 public:
  explicit ImageView(const Rect& frame = {}) : View(frame) {}
  const ImageRef& image() const { return image_; }
  void setImage(ImageRef image);
  ContentMode contentMode() const { return contentMode_; }
  void setContentMode(ContentMode mode);
  MagnificationFilter magnificationFilter() const { return magnificationFilter_; }
  void setMagnificationFilter(MagnificationFilter filter);
  Size intrinsicContentSize() const override;

 private:
  ImageRef image_;
  ContentMode contentMode_ = ContentMode::ScaleToFill;
  MagnificationFilter magnificationFilter_ = MagnificationFilter::Linear;
};

}  // namespace vaelo
