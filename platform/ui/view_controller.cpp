// SPDX-License-Identifier: GPL-3.0-or-later
#include "platform/ui/view_controller.h"

#include <algorithm>
#include <utility>

#include "platform/ui/navigation_controller.h"
#include "platform/ui/window.h"

namespace vaelo {

namespace {
constexpr Rect PhoneScreen{0, 0, 375, 667};
}

ViewController::~ViewController() {
  if (view_) view_->viewController_ = nullptr;
  if (presented_) presented_->presenting_ = nullptr;
  for (const ViewControllerRef& child : children_) child->parent_ = nullptr;
}

const ViewRef& ViewController::view() {
  if (!view_ && !loading_) {
    loading_ = true;
    loadView();
    if (!view_) ViewController::loadView();
    loading_ = false;
    viewDidLoad();
    notify(ViewControllerChange::View);
  }
  return view_;
}

void ViewController::setView(ViewRef view) {
  if (view_ == view) return;
  if (view_) view_->viewController_ = nullptr;
  view_ = std::move(view);
  if (view_) view_->viewController_ = this;
}

void ViewController::loadView() { setView(std::make_shared<View>(PhoneScreen)); }

void ViewController::viewWillTransitionToSize(const Size& size, TransitionCoordinator& coordinator) {
  for (const ViewControllerRef& child : visibleChildren()) child->viewWillTransitionToSize(size, coordinator);
  if (presented_) presented_->viewWillTransitionToSize(size, coordinator);
}

TraitCollection ViewController::traitCollection() const {
  const Window* const shownIn = window();
  return shownIn ? shownIn->traitCollection() : TraitCollection{};
}

void ViewController::setTitle(std::string title) {
  navigationItem_.setTitle(title);
  if (title_ == title) return;
  title_ = std::move(title);
  notify(ViewControllerChange::Title);
}

void ViewController::setToolbarItems(std::vector<BarButtonItemRef> items, bool) {
  if (toolbarItems_ == items) return;
  toolbarItems_ = std::move(items);
  notify(ViewControllerChange::ToolbarItems);
}

void ViewController::addChild(const ViewControllerRef& child) {
  const ViewControllerRef kept = child;
  if (kept->parent_ == this) return;
  kept->removeFromParent();
  children_.push_back(kept);
  kept->parent_ = this;
  notify(ViewControllerChange::Children);
}

void ViewController::removeFromParent() {
  ViewController* const parent = parent_;
  if (!parent) return;
  const ViewControllerRef kept = shared_from_this();
  parent_ = nullptr;
  std::erase(parent->children_, kept);
  parent->notify(ViewControllerChange::Children);
}

std::shared_ptr<NavigationController> ViewController::navigationController() const {
  for (ViewController* above = parent_; above; above = above->parent_) {
    if (auto* navigation = dynamic_cast<NavigationController*>(above)) return sharedSelf(navigation);
  }
  return nullptr;
}

ViewController* ViewController::outermost() const {
  const ViewController* top = this;
  while (top->parent_) top = top->parent_;
  return const_cast<ViewController*>(top);
}

Window* ViewController::window() const {
  const ViewController* const top = outermost();
  return top->window_ || !top->presenting_ ? top->window_ : top->presenting_->window();
}

void ViewController::presentViewController(const ViewControllerRef& presented, bool animated,
                                           std::function<void()> completion) {
  const ViewControllerRef shown = presented;
  if (!shown || shown->presenting_ || shown->outermost() == outermost()) return;
  ViewController* presenter = outermost();
  while (presenter->presented_) presenter = presenter->presented_.get();
  presenter->presented_ = shown;
  shown->presenting_ = presenter;
  Window* const shownIn = window();
  if (shownIn) shown->view()->setWindow(shownIn);
  shown->beginAppearanceTransition(true, animated);
  presenter->notify(ViewControllerChange::Presentation);
  auto done = [shown, completion = std::move(completion)] {
    // It may have been taken away again before it stood.
    if (shown->appearanceState_ == AppearanceState::Appearing) shown->endAppearanceTransition();
    if (completion) completion();
  };
  PresentationHost* const host = shownIn ? shownIn->presentationHost() : nullptr;
  if (host) {
    host->present(presenter->shared_from_this(), shown, animated, std::move(done));
  } else {
    done();
  }
}

void ViewController::dismissViewControllerAnimated(bool animated, std::function<void()> completion) {
  ViewController* const top = outermost();
  if (top->presented_) {
    top->finishPresented(animated, std::move(completion));
  } else {
    dismissSelf(animated, std::move(completion));
  }
}

void ViewController::dismissSelf(bool animated, std::function<void()> completion) {
  ViewController* const top = outermost();
  if (top->presenting_) {
    top->presenting_->finishPresented(animated, std::move(completion));
  } else if (completion) {
    completion();
  }
}

void ViewController::finishPresented(bool animated, std::function<void()> completion) {
  Window* const shownIn = window();
  PresentationHost* const host = shownIn ? shownIn->presentationHost() : nullptr;
  std::vector<ViewControllerRef> leaving;
  for (ViewControllerRef next = presented_; next; next = next->presented_) leaving.push_back(next);
  presented_ = nullptr;
  for (const ViewControllerRef& screen : leaving) {
    screen->presenting_ = nullptr;
    screen->presented_ = nullptr;
  }
  // From the top down, so that each is uncovered when it goes; only the lowest is seen to move.
  for (auto screen = leaving.rbegin(); screen != leaving.rend(); ++screen) {
    const bool lowest = std::next(screen) == leaving.rend();
    (*screen)->view()->endEditing(true);
    (*screen)->beginAppearanceTransition(false, animated && lowest);
    auto done = [gone = *screen, after = lowest ? std::exchange(completion, nullptr) : nullptr] {
      // It may be presented anew already.
      if (!gone->presenting_) {
        gone->view()->setWindow(nullptr);
        if (gone->appearanceState_ == AppearanceState::Disappearing) gone->endAppearanceTransition();
      }
      if (after) after();
    };
    if (lowest) notify(ViewControllerChange::Presentation);
    if (host) {
      host->dismiss(*screen, animated && lowest, std::move(done));
    } else {
      done();
    }
  }
}

ViewControllerRef ViewController::presentedViewController() const { return outermost()->presented_; }

ViewController* ViewController::presentingViewController() const { return outermost()->presenting_; }

void ViewController::beginAppearanceTransition(bool appearing, bool animated) {
  using enum AppearanceState;
  if (appearing ? appearanceState_ == Appearing || appearanceState_ == Appeared
                : appearanceState_ == Disappearing || appearanceState_ == Disappeared) {
    return;
  }
  if (appearing) view();
  appearanceState_ = appearing ? Appearing : Disappearing;
  transitionAnimated_ = animated;
  if (appearing) {
    viewWillAppear(animated);
  } else {
    viewWillDisappear(animated);
  }
}

void ViewController::endAppearanceTransition() {
  if (appearanceState_ == AppearanceState::Appearing) {
    appearanceState_ = AppearanceState::Appeared;
    viewDidAppear(transitionAnimated_);
  } else if (appearanceState_ == AppearanceState::Disappearing) {
    appearanceState_ = AppearanceState::Disappeared;
    viewDidDisappear(transitionAnimated_);
  }
}

}  // namespace vaelo
