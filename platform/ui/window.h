// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include "platform/ui/view_controller.h"

namespace vaelo {

class Window;

/// Gives a window its place on the display. Main thread.
class WindowHost {
 public:
  virtual ~WindowHost() = default;
  virtual void windowBecameVisible(Window& window) = 0;
};

/// The application's window.
class Window {
 public:
  Window(const Rect& frame, WindowHost* host) : frame_(frame), host_(host) {}
  const Rect& frame() const { return frame_; }
  const std::optional<Color>& backgroundColor() const { return backgroundColor_; }
  void setBackgroundColor(Color color) { backgroundColor_ = color; }
  const ViewControllerRef& rootViewController() const { return root_; }
  void setRootViewController(ViewControllerRef root) { root_ = std::move(root); }
  bool isKeyAndVisible() const { return visible_; }
  /// Loads the root's view and shows the window.
  void makeKeyAndVisible();

 private:
  Rect frame_;
  WindowHost* host_;
  std::optional<Color> backgroundColor_;
  ViewControllerRef root_;
  bool visible_ = false;
};

}  // namespace vaelo
