// SPDX-License-Identifier: GPL-3.0-or-later
#include "platform/ui/view.h"

#include <algorithm>

namespace vaelo {

void View::addSubview(const std::shared_ptr<View>& view) {
  view->removeFromSuperview();
  view->superview_ = weak_from_this();
  subviews_.push_back(view);
  view->setInWindow(inWindow_);
  notifyChanged();
}

void View::removeFromSuperview() {
  const std::shared_ptr<View> parent = superview_.lock();
  superview_.reset();
  if (!parent) return;
  const std::shared_ptr<View> self = shared_from_this();
  std::erase(parent->subviews_, self);
  setInWindow(false);
  parent->notifyChanged();
}

void View::layoutIfNeeded() {
  if (needsLayout_) {
    needsLayout_ = false;
    layoutSubviews();
  }
  for (const std::shared_ptr<View>& view : subviews_) view->layoutIfNeeded();
}

void View::setInWindow(bool inWindow) {
  inWindow_ = inWindow;
  for (const std::shared_ptr<View>& view : subviews_) view->setInWindow(inWindow);
}

}  // namespace vaelo
