// SPDX-License-Identifier: GPL-3.0-or-later
#include "platform/ui/navigation_controller.h"

#include <algorithm>

namespace vaelo {

std::shared_ptr<NavigationController> NavigationController::self() {
  return std::static_pointer_cast<NavigationController>(shared_from_this());
}

void NavigationController::setViewControllers(const ViewControllerList& stack, bool animated) {
  show(stack, animated, false);
}

void NavigationController::pushViewController(const ViewControllerRef& controller, bool animated) {
  ViewControllerList stack = stack_;
  stack.push_back(controller);
  show(std::move(stack), animated, false);
}

ViewControllerRef NavigationController::popViewController(bool animated) {
  if (stack_.size() < 2) return nullptr;
  ViewControllerRef leaving = stack_.back();
  show({stack_.begin(), stack_.end() - 1}, animated, false);
  return leaving;
}

void NavigationController::popToRootViewController(bool animated) {
  if (stack_.size() > 1) show({stack_.front()}, animated, false);
}

ViewControllerRef NavigationController::visibleViewController() const {
  ViewControllerRef visible = presentedViewController() ? presentedViewController() : topViewController();
  while (visible && visible->presentedViewController()) visible = visible->presentedViewController();
  return visible;
}

void NavigationController::setToolbarHidden(bool hidden) {
  toolbarHidden_ = hidden;
  if (host_) host_->setToolbarHidden(hidden);
}

void NavigationController::setNavigationHost(NavigationHost* host) {
  host_ = host;
  if (!host_) return;
  host_->setToolbarHidden(toolbarHidden_);
  host_->showStack(stack_, false, [] {});
}

void NavigationController::userWentBack(std::size_t count) {
  if (count == 0 || count >= stack_.size()) return;
  show({stack_.begin(), stack_.begin() + static_cast<std::ptrdiff_t>(count)}, true, true);
}

void NavigationController::show(ViewControllerList stack, bool animated, bool hostKnows) {
  const ViewControllerRef before = topViewController();
  const ViewControllerList leaving = stack_;
  stack_ = std::move(stack);
  for (const ViewControllerRef& controller : leaving) {
    if (std::find(stack_.begin(), stack_.end(), controller) == stack_.end()) controller->setNavigationController(nullptr);
  }
  for (const ViewControllerRef& controller : stack_) controller->setNavigationController(self());
  const ViewControllerRef after = topViewController();
  const bool changes = before != after;
  if (changes) {
    if (before) before->viewWillDisappear(animated);
    if (after) {
      after->view()->setInWindow(true);
      after->viewWillAppear(animated);
      if (const auto delegate = delegate_.lock()) {
        delegate->navigationControllerWillShowViewControllerAnimated(*this, after, animated);
      }
    }
  }
  const std::weak_ptr<ViewController> weakSelf = weak_from_this();
  const auto done = [weakSelf, this, before, after, animated, changes] {
    const ViewControllerRef alive = weakSelf.lock();
    if (!alive || !changes) return;
    if (before) {
      before->view()->setInWindow(false);
      before->viewDidDisappear(animated);
    }
    // A later change may have come before this one's transition ended; its own end tells of the screen that shows.
    if (!after || topViewController() != after) return;
    after->viewDidAppear(animated);
    if (const auto delegate = delegate_.lock()) {
      delegate->navigationControllerDidShowViewControllerAnimated(*this, after, animated);
    }
  };
  notifyChanged();
  if (host_) {
    host_->showStack(stack_, animated && !hostKnows, done);
  } else {
    done();
  }
}

}  // namespace vaelo
