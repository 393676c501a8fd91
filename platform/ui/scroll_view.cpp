// SPDX-License-Identifier: GPL-3.0-or-later
#include "platform/ui/scroll_view.h"

namespace vaelo {

void ScrollView::setContentSize(const Size& size) {
  if (contentSize_ == size) return;
  contentSize_ = size;
  notify(ViewChange::Scroll);
}

void ScrollView::setContentInset(const EdgeInsets& insets) {
  if (contentInset_ == insets) return;
  contentInset_ = insets;
  notify(ViewChange::Scroll);
}

void ScrollView::setContentOffset(const Point& offset, bool animated) {
  if (contentOffset_ == offset) return;
  const auto move = [this, offset] {
    contentOffset_ = offset;
    notify(ViewChange::Scroll);
  };
  if (animated) {
    animate(Animation{}, move);
  } else {
    move();
  }
}

void ScrollView::setShowsHorizontalScrollIndicator(bool shows) {
  showsHorizontal_ = shows;
  notify(ViewChange::Scroll);
}

void ScrollView::setShowsVerticalScrollIndicator(bool shows) {
  showsVertical_ = shows;
  notify(ViewChange::Scroll);
}

void ScrollView::setBounces(bool bounces) {
  bounces_ = bounces;
  notify(ViewChange::Scroll);
}

void ScrollView::setAlwaysBounceVertical(bool always) {
  alwaysBounceVertical_ = always;
  notify(ViewChange::Scroll);
}

void ScrollView::setAlwaysBounceHorizontal(bool always) {
  alwaysBounceHorizontal_ = always;
  notify(ViewChange::Scroll);
}

}  // namespace vaelo
