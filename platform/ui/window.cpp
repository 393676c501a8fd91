// SPDX-License-Identifier: GPL-3.0-or-later
#include "platform/ui/window.h"

#include <utility>

namespace vaelo {

Window::Window(const Rect& bounds) : bounds_(bounds) {}

Window::~Window() {
  if (!root_) return;
  root_->window_ = nullptr;
  if (root_->isViewLoaded()) root_->view()->setWindow(nullptr);
}

void Window::setRootViewController(ViewControllerRef root) {
  if (root_ == root) return;
  if (const ViewControllerRef old = std::exchange(root_, std::move(root))) {
    old->beginAppearanceTransition(false, false);
    old->window_ = nullptr;
    if (old->isViewLoaded()) old->view()->setWindow(nullptr);
    old->endAppearanceTransition();
  }
  if (root_) root_->window_ = this;
  if (visible_) showRoot();
  changed_.emit(*this);
}

void Window::setBackgroundColor(std::optional<Color> color) {
  if (backgroundColor_ == color) return;
  backgroundColor_ = color;
  changed_.emit(*this);
}

void Window::resize(const Size& size, bool animated) {
  if (bounds_.size() == size) return;
  TransitionCoordinator coordinator{animated};
  if (root_ && visible_) root_->viewWillTransitionToSize(size, coordinator);
  bounds_.width = size.width;
  bounds_.height = size.height;
  if (!root_ || !root_->isViewLoaded()) return;
  root_->view()->setFrame({0, 0, size.width, size.height});
  root_->view()->layoutIfNeeded();
}

void Window::setTraitCollection(const TraitCollection& traits) {
  if (traits_ == traits) return;
  traits_ = traits;
  changed_.emit(*this);
}

void Window::makeKeyAndVisible() {
  if (visible_) return;
  visible_ = true;
  showRoot();
}

void Window::showRoot() {
  if (!root_) return;
  root_->view()->setFrame({0, 0, bounds_.width, bounds_.height});
  root_->view()->setWindow(this);
  root_->beginAppearanceTransition(true, false);
  root_->view()->layoutIfNeeded();
  root_->endAppearanceTransition();
}

}  // namespace vaelo
