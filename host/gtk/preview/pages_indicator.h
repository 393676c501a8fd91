// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <gtk/gtk.h>

#include <functional>

namespace vaelo {

/// Says which page is read, "3 of 500", and leads to another one. Main thread.
class PagesIndicator {
 public:
  /// `chosen` is called with a page, counted from 0.
  explicit PagesIndicator(std::function<void(int)> chosen);
  ~PagesIndicator();
  PagesIndicator(const PagesIndicator&) = delete;
  PagesIndicator& operator=(const PagesIndicator&) = delete;
  GtkWidget* widget() const { return button_; }
  void show(int page, int count);
  /// Asks for a page.
  void open() { gtk_menu_button_popup(GTK_MENU_BUTTON(button_)); }

 private:
  void activated();

  std::function<void(int)> chosen_;
  GtkWidget* button_;
  GtkWidget* popover_;
  GtkWidget* entry_;
  int page_ = -1;
  int count_ = 0;
};

}  // namespace vaelo
