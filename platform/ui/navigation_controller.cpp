// SPDX-License-Identifier: GPL-3.0-or-later
#include "platform/ui/navigation_controller.h"

#include <algorithm>
#include <utility>

#include "platform/platform.h"
#include "platform/ui/document_list_controller.h"
#include "platform/ui/screen_factory.h"

namespace vaelo {

namespace {

constexpr const char* ListFolderKey = "ListFolder";

}  // namespace

NavigationController::~NavigationController() = default;

void NavigationController::setViewControllers(std::vector<ViewControllerRef> controllers, bool animated) {
  changeStack(std::move(controllers), animated, false);
}

void NavigationController::pushViewController(const ViewControllerRef& controller, bool animated) {
  std::vector<ViewControllerRef> next = stack_;
  next.push_back(controller);
  changeStack(std::move(next), animated, false);
}

ViewControllerRef NavigationController::popViewControllerAnimated(bool animated) {
  if (stack_.size() <= 1) return nullptr;
  const ViewControllerRef popped = stack_.back();
  changeStack({stack_.begin(), stack_.end() - 1}, animated, false);
  return popped;
}

std::vector<ViewControllerRef> NavigationController::popToRootViewControllerAnimated(bool animated) {
  if (stack_.size() <= 1) return {};
  const std::vector<ViewControllerRef> popped(stack_.begin() + 1, stack_.end());
  changeStack({stack_.front()}, animated, false);
  return popped;
}

ViewControllerRef NavigationController::visibleViewController() const {
  ViewControllerRef visible = presentedViewController();
  if (!visible) return topViewController();
  while (const ViewControllerRef above = visible->presentedViewController()) visible = above;
  return visible;
}

void NavigationController::changeStack(std::vector<ViewControllerRef> next, bool animated, bool hostShowsItAlready) {
  const ViewControllerRef kept = weak_from_this().lock();
  if (transition_) finishTransition(transition_);
  std::erase(next, nullptr);
  if (next == stack_) return;
  const std::vector<ViewControllerRef> old = std::exchange(stack_, std::move(next));
  for (const ViewControllerRef& screen : stack_) {
    addChild(screen);
    if (std::find(old.begin(), old.end(), screen) == old.end()) screen->didMoveToParent(this);
  }
  const auto transition = std::make_shared<Transition>();
  transition->from = old.empty() ? nullptr : old.back();
  transition->to = topViewController();
  transition->animated = animated;
  transition_ = transition;
  if (transition->from != transition->to) {
    const auto told = delegate();
    if (told && transition->to) told->navigationControllerWillShowViewControllerAnimated(*this, transition->to, animated);
    if (isViewLoaded() && transition_ == transition) {
      if (transition->from) transition->from->beginAppearanceTransition(false, animated);
      if (transition->to) transition->to->beginAppearanceTransition(true, animated);
    }
    // One of those who were told may have changed the stack again, which ended this transition.
    if (transition_ != transition) return;
    if (isViewLoaded()) attachTopView();
  }
  if (host_ && !hostShowsItAlready) {
    auto done = [weak = weak_from_this(), transition] {
      const auto self = std::static_pointer_cast<NavigationController>(weak.lock());
      if (self && self->transition_ == transition) self->finishTransition(transition);
    };
    host_->stackChanged(old, stack_, animated, std::move(done));
  } else {
    finishTransition(transition);
  }
}

void NavigationController::finishTransition(const std::shared_ptr<Transition>& transition) {
  const std::shared_ptr<Transition> ended = transition;
  transition_.reset();
  const bool topChanged = ended->from != ended->to;
  if (topChanged && ended->from) {
    const ViewRef shown = ended->from->isViewLoaded() ? ended->from->view() : nullptr;
    if (shown && isViewLoaded() && shown->superview() == view().get()) shown->removeFromSuperview();
    ended->from->endAppearanceTransition();
  }
  if (topChanged && ended->to) ended->to->endAppearanceTransition();
  const std::vector<ViewControllerRef> before = children();
  for (const ViewControllerRef& screen : before) {
    if (std::find(stack_.begin(), stack_.end(), screen) != stack_.end()) continue;
    screen->removeFromParent();
    screen->didMoveToParent(nullptr);
  }
  const auto told = delegate();
  if (told && topChanged && ended->to) {
    told->navigationControllerDidShowViewControllerAnimated(*this, ended->to, ended->animated);
  }
}

void NavigationController::attachTopView() {
  const ViewControllerRef top = topViewController();
  if (!top || top->view()->superview() == view().get()) return;
  top->view()->setAutoresizingMask(FlexibleWidth | FlexibleHeight);
  top->view()->setFrame(view()->bounds());
  view()->addSubview(top->view());
}

void NavigationController::setToolbarHidden(bool hidden, bool animated) {
  if (toolbarHidden_ == hidden) return;
  toolbarHidden_ = hidden;
  if (host_) host_->toolbarHiddenChanged(hidden, animated);
}

void NavigationController::setBarHeights(double navigationBar, double toolbar) {
  navigationBarHeight_ = navigationBar;
  toolbarHeight_ = toolbar;
}

void NavigationController::setHost(NavigationHost* host) {
  host_ = host;
  // Whoever would have ended the running transition is gone.
  if (transition_) finishTransition(transition_);
}

void NavigationController::userWentBackTo(std::size_t count) {
  if (count == 0 || count >= stack_.size()) return;
  changeStack({stack_.begin(), stack_.begin() + static_cast<std::ptrdiff_t>(count)}, true, true);
}

void NavigationController::viewDidLoad() {
  ViewController::viewDidLoad();
  attachTopView();
}

void NavigationController::viewWillAppear(bool animated) {
  ViewController::viewWillAppear(animated);
  if (const ViewControllerRef top = topViewController()) top->beginAppearanceTransition(true, animated);
}

void NavigationController::viewDidAppear(bool animated) {
  ViewController::viewDidAppear(animated);
  const ViewControllerRef top = topViewController();
  if (top && !transition_) top->endAppearanceTransition();
}

void NavigationController::viewWillDisappear(bool animated) {
  ViewController::viewWillDisappear(animated);
  if (const ViewControllerRef top = topViewController()) top->beginAppearanceTransition(false, animated);
}

void NavigationController::viewDidDisappear(bool animated) {
  ViewController::viewDidDisappear(animated);
  if (const ViewControllerRef top = topViewController()) top->endAppearanceTransition();
}

void NavigationController::encodeRestorableStateWithCoder(RestorationCoder& coder) {
  ViewController::encodeRestorableStateWithCoder(coder);
  for (auto screen = stack_.rbegin(); screen != stack_.rend(); ++screen) {
    const auto list = std::dynamic_pointer_cast<DocumentListController>(*screen);
    if (!list || !list->presentedURL()) continue;
    // Every start begins with the root list.
    if (!list->showsAllContainers()) coder.encode(ListFolderKey, *list->presentedURL());
    return;
  }
}

void NavigationController::decodeRestorableStateWithCoder(const RestorationCoder& coder) {
  ViewController::decodeRestorableStateWithCoder(coder);
  const Value value = coder.decode(ListFolderKey);
  const URL* folder = value.get<URL>();
  bool isDirectory = false;
  if (!folder || !Platform::current().fileManager.fileExistsAtPath(folder->path(), &isDirectory) || !isDirectory) return;
  const auto lists = Platform::current().screens.hierarchyTo(*folder);
  if (lists) setViewControllers({lists->begin(), lists->end()}, false);
}

std::vector<ViewControllerRef> NavigationController::visibleChildren() const {
  if (stack_.empty()) return {};
  return {stack_.back()};
}

}  // namespace vaelo
