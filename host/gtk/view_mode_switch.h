// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <gtk/gtk.h>

#include <functional>

#include "host/support/glib_ptr.h"

namespace vaelo {

/// Switches between rows and an icon grid, by an action for menus and by buttons, which show what the next press does.
/// Main thread.
class ViewModeSwitch {
 public:
  /// `chosen` is told whether a grid is wanted.
  explicit ViewModeSwitch(std::function<void(bool grid)> chosen);
  ~ViewModeSwitch();
  ViewModeSwitch(const ViewModeSwitch&) = delete;
  ViewModeSwitch& operator=(const ViewModeSwitch&) = delete;

  /// With the action "grid", whose state is a boolean.
  GActionGroup* actions() const { return G_ACTION_GROUP(actions_.get()); }
  /// The caller sinks the reference.
  GtkWidget* makeButton() const;

 private:
  std::function<void(bool grid)> chosen_;
  GRef<GSimpleAction> grid_;
  GRef<GSimpleActionGroup> actions_;
};

}  // namespace vaelo
