// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <gtk/gtk.h>

#include <functional>

#include "host/support/glib_ptr.h"

namespace vaelo {

/// Whether one of the application's windows has the focus, a dialog of its own as well. The focus that goes from one of them
/// to another is in none for an instant, and so it is while a menu opens: only what lasts counts. Main thread.
class WindowFocus {
 public:
  /// `changed` is told each change; at first no window has the focus.
  explicit WindowFocus(std::function<void(bool focused)> changed);
  ~WindowFocus();
  WindowFocus(const WindowFocus&) = delete;
  WindowFocus& operator=(const WindowFocus&) = delete;

 private:
  void watch(guint first, guint count);
  void look();

  const std::function<void(bool)> changed_;
  GRef<GListModel> windows_;
  GRef<GObject> anchor_;  // whose end disconnects from the windows
  bool focused_ = false;
  guint timer_ = 0;
};

}  // namespace vaelo
