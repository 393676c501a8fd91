// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <gtk/gtk.h>

#include <functional>
#include <memory>
#include <string>

namespace vaelo {

/// Tells a sentence in the window that a widget is in, or was in last. Main thread.
class WindowNotice {
 public:
  /// The object goes before the widget.
  explicit WindowNotice(GtkWidget* widget);
  ~WindowNotice();
  WindowNotice(const WindowNotice&) = delete;
  WindowNotice& operator=(const WindowNotice&) = delete;
  /// Tells also when widget, object or window are gone: then as a notification of the desktop.
  std::function<void(const std::string& sentence)> teller() const;

 private:
  struct Window;
  GtkWidget* widget_;
  gulong mapped_;
  std::shared_ptr<Window> window_;
};

}  // namespace vaelo
