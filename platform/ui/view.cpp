// SPDX-License-Identifier: GPL-3.0-or-later
#include "platform/ui/view.h"

#include <algorithm>
#include <utility>

#include "platform/ui/view_controller.h"
#include "platform/ui/window.h"

namespace vaelo {

namespace {

template <typename T>
bool assign(T& property, T value) {
  if (property == value) return false;
  property = std::move(value);
  return true;
}

const View& rootOf(const View& view) {
  const View* root = &view;
  while (root->superview()) root = root->superview();
  return *root;
}

/// Gives the change of the superview's extent to the flexible ones of margin, extent and margin in equal parts.
void resize(double delta, bool flexibleBefore, bool flexibleExtent, double& position, double& extent, bool flexibleAfter) {
  const int parts = (flexibleBefore ? 1 : 0) + (flexibleExtent ? 1 : 0) + (flexibleAfter ? 1 : 0);
  if (parts == 0) return;
  if (flexibleBefore) position += delta / parts;
  if (flexibleExtent) extent = std::max(0.0, extent + delta / parts);
}

}  // namespace

View::View(const Rect& frame) : frame_(frame) {}

View::~View() {
  if (observer_) observer_->viewWillBeDestroyed(*this);
  observer_ = nullptr;
  const auto referring = referringConstraints_;
  for (const auto& weak : referring) {
    if (const LayoutConstraintRef constraint = weak.lock()) constraint->itemWasDestroyed(this);
  }
  for (const LayoutConstraintRef& constraint : constraints_) constraint->holder_ = nullptr;
  for (const ViewRef& view : subviews_) view->superview_ = nullptr;
}

void View::addSubview(const ViewRef& view) { insertSubview(view, subviews_.size()); }

void View::insertSubview(const ViewRef& view, std::size_t index) {
  const ViewRef kept = view;
  kept->removeFromSuperview();
  const auto place = std::min(index, subviews_.size());
  subviews_.insert(subviews_.begin() + static_cast<std::ptrdiff_t>(place), kept);
  kept->superview_ = this;
  needsLayout_ = true;
  notify(ViewChange::Subviews);
  if (isInWindow()) kept->tellMovedToWindow();
}

void View::removeFromSuperview() {
  View* const parent = superview_;
  if (!parent) return;
  const bool wasInWindow = isInWindow();
  const auto found = std::find_if(parent->subviews_.begin(), parent->subviews_.end(),
                                  [this](const ViewRef& view) { return view.get() == this; });
  const ViewRef kept = *found;
  for (View* above = parent; above; above = above->superview_) above->dropConstraintsReaching(*this);
  parent->willRemoveSubview(*this);
  std::erase(parent->subviews_, kept);
  superview_ = nullptr;
  parent->notify(ViewChange::Subviews);
  if (wasInWindow) tellMovedToWindow();
}

void View::dropConstraintsReaching(const View& leaving) {
  const auto held = constraints_;
  for (const LayoutConstraintRef& constraint : held) {
    const View* const first = constraint->firstItem();
    const View* const second = constraint->secondItem();
    if ((first && first->isDescendantOf(leaving)) || (second && second->isDescendantOf(leaving))) {
      constraint->setActive(false);
    }
  }
}

bool View::isDescendantOf(const View& other) const {
  for (const View* view = this; view; view = view->superview_) {
    if (view == &other) return true;
  }
  return false;
}

Window* View::window() const { return rootOf(*this).window_; }

void View::setWindow(Window* window) {
  if (assign(window_, window)) tellMovedToWindow();
}

void View::tellMovedToWindow() {
  didMoveToWindow();
  const auto views = subviews_;
  for (const ViewRef& view : views) view->tellMovedToWindow();
}

TraitCollection View::traitCollection() const {
  const Window* const shownIn = window();
  return shownIn ? shownIn->traitCollection() : TraitCollection{};
}

void View::keepFrame(const Rect& frame) {
  const Size oldSize = frame_.size();
  frame_ = frame;
  if (frame_.size() == oldSize) return;
  needsLayout_ = true;
  resizeSubviews(oldSize);
}

void View::setFrame(const Rect& frame) {
  if (frame_ == frame) return;
  keepFrame(frame);
  notify(ViewChange::Frame);
}

void View::setBounds(const Rect& bounds) {
  const bool moved = assign(boundsOrigin_, bounds.origin());
  if (moved && frame_.size() == bounds.size()) notify(ViewChange::Frame);
  setFrame({frame_.x, frame_.y, bounds.width, bounds.height});
}

Rect View::convertRectTo(const Rect& rect, const View& other) const {
  Rect result = rect;
  for (const View* view = this; view->superview_; view = view->superview_) {
    result = result.offsetBy(view->frame_.x - view->boundsOrigin_.x, view->frame_.y - view->boundsOrigin_.y);
  }
  for (const View* view = &other; view->superview_; view = view->superview_) {
    result = result.offsetBy(view->boundsOrigin_.x - view->frame_.x, view->boundsOrigin_.y - view->frame_.y);
  }
  return result;
}

void View::applyLayoutFrame(const Rect& frame) {
  keepFrame(frame);
  layoutIfNeeded();
}

void View::resizeSubviews(const Size& oldSize) {
  const double dx = frame_.width - oldSize.width;
  const double dy = frame_.height - oldSize.height;
  const auto views = subviews_;
  for (const ViewRef& view : views) {
    const unsigned mask = view->autoresizingMask_;
    if (!view->translatesAutoresizingMask_ || mask == AutoresizingNone) continue;
    Rect next = view->frame_;
    resize(dx, mask & FlexibleLeftMargin, mask & FlexibleWidth, next.x, next.width, mask & FlexibleRightMargin);
    resize(dy, mask & FlexibleTopMargin, mask & FlexibleHeight, next.y, next.height, mask & FlexibleBottomMargin);
    view->setFrame(next);
  }
}

void View::setHidden(bool hidden) {
  if (assign(hidden_, hidden)) notify(ViewChange::Visibility);
}

void View::setAlpha(double alpha) {
  if (assign(alpha_, alpha)) notify(ViewChange::Visibility);
}

void View::setOpaque(bool opaque) {
  if (assign(opaque_, opaque)) notify(ViewChange::Appearance);
}

void View::setBackgroundColor(std::optional<Color> color) {
  if (assign(backgroundColor_, color)) notify(ViewChange::Appearance);
}

void View::setBorder(double width, const Color& color) {
  const bool widthChanged = assign(borderWidth_, width);
  if (assign(borderColor_, color) || widthChanged) notify(ViewChange::Appearance);
}

void View::setAccessibilityLabel(std::string label) {
  if (assign(accessibilityLabel_, std::move(label))) notify(ViewChange::Description);
}

void View::setDebugName(std::string name) {
  if (assign(debugName_, std::move(name))) notify(ViewChange::Description);
}

void View::setAutoresizingMask(unsigned mask) {
  if (assign(autoresizingMask_, mask)) notify(ViewChange::Constraints);
}

void View::setTranslatesAutoresizingMaskIntoConstraints(bool translates) {
  if (assign(translatesAutoresizingMask_, translates)) notify(ViewChange::Constraints);
}

void View::setContentHuggingPriority(float priority, LayoutAxis axis) {
  if (assign(hugging_[static_cast<int>(axis)], priority)) notify(ViewChange::Constraints);
}

void View::setContentCompressionResistancePriority(float priority, LayoutAxis axis) {
  if (assign(resistance_[static_cast<int>(axis)], priority)) notify(ViewChange::Constraints);
}

void View::setNeedsLayout() {
  needsLayout_ = true;
  notify(ViewChange::Layout);
}

void View::layoutIfNeeded() {
  if (needsLayout_) {
    needsLayout_ = false;
    if (viewController_) viewController_->viewWillLayoutSubviews();
    layoutSubviews();
    if (viewController_) viewController_->viewDidLayoutSubviews();
  }
  const auto views = subviews_;
  for (const ViewRef& view : views) view->layoutIfNeeded();
}

void View::invalidateIntrinsicContentSize() { notify(ViewChange::Constraints); }

Size View::sizeThatFits(const Size&) const {
  const Size natural = intrinsicContentSize();
  return {natural.width == NoIntrinsicMetric ? frame_.width : natural.width,
          natural.height == NoIntrinsicMetric ? frame_.height : natural.height};
}

void View::sizeToFit() {
  const Size best = sizeThatFits(frame_.size());
  setFrame({frame_.x, frame_.y, best.width, best.height});
  layoutIfNeeded();
}

void View::setNeedsDisplay() { notify(ViewChange::Display); }

void View::animate(const Animation& animation, const std::function<void()>& changes,
                   const std::function<void()>& completion) {
  const ViewRef kept = weak_from_this().lock();
  if (observer_) observer_->animationWillBegin(*this, animation);
  if (changes) changes();
  if (observer_) observer_->animationDidEnd(*this);
  if (completion) completion();
}

void View::setUserInteractionEnabled(bool enabled) {
  if (assign(userInteractionEnabled_, enabled)) notify(ViewChange::Interaction);
}

void View::addGestureRecognizer(TapGestureRecognizerRef recognizer) {
  gestureRecognizers_.push_back(std::move(recognizer));
  notify(ViewChange::Interaction);
}

void View::removeGestureRecognizer(const TapGestureRecognizerRef& recognizer) {
  if (std::erase(gestureRecognizers_, recognizer) > 0) notify(ViewChange::Interaction);
}

bool View::endEditing(bool force) {
  bool ended = true;
  const auto views = subviews_;
  for (const ViewRef& view : views) ended = view->endEditing(force) && ended;
  return ended;
}

void View::notify(ViewChange change) {
  if (observer_) observer_->viewChanged(*this, change);
}

void View::remember(const LayoutConstraintRef& constraint) {
  std::erase_if(referringConstraints_, [](const auto& weak) { return weak.expired(); });
  referringConstraints_.push_back(constraint);
}

}  // namespace vaelo
