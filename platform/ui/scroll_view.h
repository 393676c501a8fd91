// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include "platform/ui/view.h"

namespace vaelo {

/// A view that shows a part of a larger content. Main thread.
class ScrollView : public View {
 public:
  explicit ScrollView(const Rect& frame = {}) : View(frame) {}
  const Size& contentSize() const { return contentSize_; }
  void setContentSize(const Size& size);
  /// Room around the content that scrolling can reach.
  const EdgeInsets& contentInset() const { return contentInset_; }
  void setContentInset(const EdgeInsets& insets);
  /// The content's point at the top left of the view.
  const Point& contentOffset() const { return contentOffset_; }
  void setContentOffset(const Point& offset, bool animated = false);
  bool showsHorizontalScrollIndicator() const { return showsHorizontal_; }
  void setShowsHorizontalScrollIndicator(bool shows);
  bool showsVerticalScrollIndicator() const { return showsVertical_; }
  void setShowsVerticalScrollIndicator(bool shows);
  bool bounces() const { return bounces_; }
  void setBounces(bool bounces);
  bool alwaysBounceVertical() const { return alwaysBounceVertical_; }
  void setAlwaysBounceVertical(bool always);
  bool alwaysBounceHorizontal() const { return alwaysBounceHorizontal_; }
  void setAlwaysBounceHorizontal(bool always);

 private:
  Size contentSize_;
  EdgeInsets contentInset_;
  Point contentOffset_;
  bool showsHorizontal_ = true;
  bool showsVertical_ = true;
  bool bounces_ = true;
  bool alwaysBounceVertical_ = false;
  bool alwaysBounceHorizontal_ = false;
};

}  // namespace vaelo
