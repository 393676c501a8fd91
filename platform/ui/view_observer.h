// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

namespace vaelo {

class View;

/// What changed in a view.
enum class ViewChange {
  Subviews,     ///< subviews or arranged subviews came, went or changed order
  Frame,        ///< frame or bounds
  Visibility,   ///< hidden or alpha
  Appearance,   ///< colours, opacity, border, fonts, alignment, content mode
  Content,      ///< text, image, title, placeholder, whatever the view shows
  Constraints,  ///< constraints that the view holds, autoresizing, hugging, compression resistance, intrinsic size
  Arrangement,  ///< axis, alignment, distribution, spacing of a stack view
  Layout,       ///< layout was requested
  Display,      ///< drawing was requested
  Interaction,  ///< enabled, touchable, recognizers, keyboard properties
  Scroll,       ///< content size, insets, offset, bouncing, indicators
  Focus,        ///< a text field began or ended editing
  Selection,    ///< the selection of a text field
  Description,  ///< accessibility label, debug name
};

/// Curves of an animation; the codes are those of keyboard notices.
enum class AnimationCurve { EaseInOut = 0, EaseIn = 1, EaseOut = 2, Linear = 3, Keyboard = 7 };

struct Animation {
  double seconds = 0.25;
  AnimationCurve curve = AnimationCurve::EaseInOut;
  bool layoutSubviews = false;
  bool beginFromCurrentState = false;
};

/// Mirrors a view. Called on the main thread after the change, while the view is whole.
class ViewObserver {
 public:
  virtual ~ViewObserver() = default;
  virtual void viewChanged(View& view, ViewChange change) = 0;
  /// Changes between the two calls are to be animated.
  virtual void animationWillBegin(View& view, const Animation& animation) = 0;
  virtual void animationDidEnd(View& view) = 0;
  /// `view` is being destroyed; it must not be used any more.
  virtual void viewWillBeDestroyed(View& view) = 0;
};

}  // namespace vaelo
