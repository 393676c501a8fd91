// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <memory>
#include <optional>
#include <string>
#include <vector>

#include "platform/ui/geometry.h"
#include "platform/ui/observable.h"
#include "platform/ui/trait_collection.h"

namespace vaelo {

class LayoutConstraint;

/// A rectangle on a screen, with views in it. Main thread.
///
/// Parents own their subviews. The host mirrors a view into a widget and writes back the frame that layout gave it.
class View : public Observable, public std::enable_shared_from_this<View> {
 public:
  static constexpr float RequiredPriority = 1000;

  View() = default;
  virtual ~View() = default;
  View(const View&) = delete;
  View& operator=(const View&) = delete;

  void addSubview(const std::shared_ptr<View>& view);
  void removeFromSuperview();
  const std::vector<std::shared_ptr<View>>& subviews() const { return subviews_; }
  std::shared_ptr<View> superview() const { return superview_.lock(); }

  /// In the superview's coordinates.
  const Rect& frame() const { return frame_; }
  void setFrame(const Rect& frame) { set(frame_, frame); }
  Rect bounds() const { return {{0, 0}, frame_.size}; }
  /// Lays out now what setNeedsLayout asked for.
  void layoutIfNeeded();
  void setNeedsLayout() { needsLayout_ = true; notifyChanged(); }
  /// Places the subviews; subclasses extend it.
  virtual void layoutSubviews() {}
  /// The size that fits the content; the current size unless a subclass knows better.
  virtual Size sizeThatFits() const { return frame_.size; }
  void sizeToFit() { setFrame({frame_.origin, sizeThatFits()}); }

  bool isHidden() const { return hidden_; }
  void setHidden(bool hidden) { set(hidden_, hidden); }
  bool isOpaque() const { return opaque_; }
  void setOpaque(bool opaque) { set(opaque_, opaque); }
  const std::optional<Color>& backgroundColor() const { return backgroundColor_; }
  void setBackgroundColor(std::optional<Color> color) { set(backgroundColor_, color); }
  /// What a screen reader says.
  const std::string& accessibilityLabel() const { return accessibilityLabel_; }
  void setAccessibilityLabel(std::string label) { set(accessibilityLabel_, std::move(label)); }
  const std::string& debugName() const { return debugName_; }
  void setDebugName(std::string name) { debugName_ = std::move(name); }

  /// How hard the view resists being larger (hugging) or smaller (compression resistance) than its content, 1 to 1000.
  struct Priorities {
    float horizontal = 250;
    float vertical = 250;
    friend bool operator==(const Priorities&, const Priorities&) = default;
  };
  const Priorities& contentHugging() const { return contentHugging_; }
  void setContentHugging(Priorities priorities) { set(contentHugging_, priorities); }
  const Priorities& compressionResistance() const { return compressionResistance_; }
  void setCompressionResistance(Priorities priorities) { set(compressionResistance_, priorities); }

  /// True while the view is on a screen that a window shows.
  bool isInWindow() const { return inWindow_; }
  void setInWindow(bool inWindow);

 private:
  std::weak_ptr<View> superview_;
  std::vector<std::shared_ptr<View>> subviews_;
  Rect frame_;
  std::optional<Color> backgroundColor_;
  std::string accessibilityLabel_;
  std::string debugName_;
  Priorities contentHugging_;
  Priorities compressionResistance_{750, 750};
  bool hidden_ = false;
  bool opaque_ = true;
  bool inWindow_ = false;
  bool needsLayout_ = false;
};

}  // namespace vaelo
