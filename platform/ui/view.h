// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <functional>
#include <memory>
#include <optional>
#include <string>
#include <vector>

#include "platform/ui/color.h"
#include "platform/ui/geometry.h"
#include "platform/ui/gesture_recognizer.h"
#include "platform/ui/layout_constraint.h"
#include "platform/ui/shared_self.h"
#include "platform/ui/trait_collection.h"
#include "platform/ui/view_observer.h"

namespace vaelo {

class DrawingContext;
class ViewController;
class Window;

enum AutoresizingMask : unsigned {
  AutoresizingNone = 0,
  FlexibleLeftMargin = 1,
  FlexibleWidth = 2,
  FlexibleRightMargin = 4,
  FlexibleTopMargin = 8,
  FlexibleHeight = 16,
  FlexibleBottomMargin = 32,
};

/// A rectangle on the screen: properties that a host mirrors, and subviews that it owns. It draws nothing itself and solves
/// no constraints; the host (or a test) reports the resulting frames with applyLayoutFrame. Main thread.
class View : public std::enable_shared_from_this<View> {
 public:
  /// A size without a natural width or height has this in its place.
  static constexpr double NoIntrinsicMetric = -1;

  explicit View(const Rect& frame = {});
  virtual ~View();
  View(const View&) = delete;
  View& operator=(const View&) = delete;

  // The tree.
  /// Null for none; not owned.
  View* superview() const { return superview_; }
  const std::vector<std::shared_ptr<View>>& subviews() const { return subviews_; }
  /// Puts `view` on top, taking it from where it was. May be used in constructors.
  void addSubview(const std::shared_ptr<View>& view);
  void insertSubview(const std::shared_ptr<View>& view, std::size_t index);
  /// Also deactivates the constraints that tie the view to what it leaves.
  void removeFromSuperview();
  /// True for itself too.
  bool isDescendantOf(const View& other) const;
  Window* window() const;
  bool isInWindow() const { return window() != nullptr; }
  /// The screen whose root view this is; null for other views.
  ViewController* viewController() const { return viewController_; }
  TraitCollection traitCollection() const;

  // Geometry.
  /// In the superview's coordinates.
  const Rect& frame() const { return frame_; }
  void setFrame(const Rect& frame);
  /// In the view's own coordinates.
  Rect bounds() const { return {boundsOrigin_.x, boundsOrigin_.y, frame_.width, frame_.height}; }
  /// Keeps the frame's origin.
  void setBounds(const Rect& bounds);
  /// `rect` of this view in the coordinates of `other`, which is in the same tree.
  Rect convertRectTo(const Rect& rect, const View& other) const;
  /// For the host: takes the frame that layout gave, without telling the observer, and lays out.
  void applyLayoutFrame(const Rect& frame);

  // Appearance.
  bool hidden() const { return hidden_; }
  void setHidden(bool hidden);
  double alpha() const { return alpha_; }
  void setAlpha(double alpha);
  bool opaque() const { return opaque_; }
  void setOpaque(bool opaque);
  const std::optional<Color>& backgroundColor() const { return backgroundColor_; }
  void setBackgroundColor(std::optional<Color> color);
  double borderWidth() const { return borderWidth_; }
  const Color& borderColor() const { return borderColor_; }
  void setBorder(double width, const Color& color);
  const std::string& accessibilityLabel() const { return accessibilityLabel_; }
  void setAccessibilityLabel(std::string label);
  /// A name for layout debugging and style rules; not shown.
  const std::string& debugName() const { return debugName_; }
  void setDebugName(std::string name);

  // Layout.
  unsigned autoresizingMask() const { return autoresizingMask_; }
  void setAutoresizingMask(unsigned mask);
  /// True (the start): frame and autoresizing mask place the view. False: constraints do.
  bool translatesAutoresizingMaskIntoConstraints() const { return translatesAutoresizingMask_; }
  void setTranslatesAutoresizingMaskIntoConstraints(bool translates);
  float contentHuggingPriority(LayoutAxis axis) const { return hugging_[static_cast<int>(axis)]; }
  void setContentHuggingPriority(float priority, LayoutAxis axis);
  float contentCompressionResistancePriority(LayoutAxis axis) const { return resistance_[static_cast<int>(axis)]; }
  void setContentCompressionResistancePriority(float priority, LayoutAxis axis);
  /// The active constraints that this view keeps.
  const std::vector<LayoutConstraintRef>& constraints() const { return constraints_; }
  void setNeedsLayout();
  bool needsLayout() const { return needsLayout_; }
  /// Runs the layout of this view and its subviews where it was requested.
  void layoutIfNeeded();
  /// Places the subviews; subclasses call the base first.
  virtual void layoutSubviews() {}
  /// The natural size; NoIntrinsicMetric where there is none.
  virtual Size intrinsicContentSize() const { return {NoIntrinsicMetric, NoIntrinsicMetric}; }
  void invalidateIntrinsicContentSize();
  /// The best size within `size`; by default the natural one, or else the present one.
  virtual Size sizeThatFits(const Size& size) const;
  void sizeToFit();

  // Drawing.
  void setNeedsDisplay();
  /// Draws the content; the base draws nothing.
  virtual void drawRect(DrawingContext&, const Rect&) {}
  /// True in subclasses that draw themselves, so that the host makes a canvas for them.
  virtual bool drawsContent() const { return false; }
  /// Runs `changes` so that the host animates them, then `completion`.
  void animate(const Animation& animation, const std::function<void()>& changes,
               const std::function<void()>& completion = nullptr);

  // Touches and focus.
  bool userInteractionEnabled() const { return userInteractionEnabled_; }
  void setUserInteractionEnabled(bool enabled);
  const std::vector<TapGestureRecognizerRef>& gestureRecognizers() const { return gestureRecognizers_; }
  void addGestureRecognizer(TapGestureRecognizerRef recognizer);
  void removeGestureRecognizer(const TapGestureRecognizerRef& recognizer);
  /// Ends the editing of a text field in the view, where its delegate allows or `force` is set. False when refused.
  virtual bool endEditing(bool force);

  /// One observer mirrors the view; null for none. It must be taken away before it is destroyed.
  ViewObserver* observer() const { return observer_; }
  void setObserver(ViewObserver* observer) { observer_ = observer; }

 protected:
  /// Tells the observer.
  void notify(ViewChange change);
  /// Called when the view, or a view above it, came into a window or left it.
  virtual void didMoveToWindow() {}
  /// Called before a subview leaves.
  virtual void willRemoveSubview(View&) {}

 private:
  friend class LayoutConstraint;
  friend class ViewController;
  friend class Window;
  void setWindow(Window* window);
  void tellMovedToWindow();
  void resizeSubviews(const Size& oldSize);
  void keepFrame(const Rect& frame);
  void dropConstraintsReaching(const View& leaving);
  void remember(const LayoutConstraintRef& constraint);

  View* superview_ = nullptr;
  std::vector<std::shared_ptr<View>> subviews_;
  Window* window_ = nullptr;  // of a root view only
  ViewController* viewController_ = nullptr;
  Rect frame_;
  Point boundsOrigin_;
  bool hidden_ = false;
  bool opaque_ = true;
  bool needsLayout_ = true;
  bool translatesAutoresizingMask_ = true;
  bool userInteractionEnabled_ = true;
  double alpha_ = 1;
  double borderWidth_ = 0;
  Color borderColor_;
  std::optional<Color> backgroundColor_;
  std::string accessibilityLabel_;
  std::string debugName_;
  unsigned autoresizingMask_ = AutoresizingNone;
  float hugging_[2] = {LayoutPriority::DefaultLow, LayoutPriority::DefaultLow};
  float resistance_[2] = {LayoutPriority::DefaultHigh, LayoutPriority::DefaultHigh};
  std::vector<LayoutConstraintRef> constraints_;
  std::vector<std::weak_ptr<LayoutConstraint>> referringConstraints_;
  std::vector<TapGestureRecognizerRef> gestureRecognizers_;
  ViewObserver* observer_ = nullptr;
};

using ViewRef = std::shared_ptr<View>;

}  // namespace vaelo
