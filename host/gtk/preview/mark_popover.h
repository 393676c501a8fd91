// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <gtk/gtk.h>

#include <functional>
#include <string>

#include "host/gtk/preview/page_mark.h"

namespace vaelo {

/// What can be done to a mark that was touched. Main thread.
class MarkPopover {
 public:
  /// Each is called at most once, after the popover closed.
  struct Events {
    std::function<void()> remove;
    std::function<void()> edit;  ///< of a note; null when its text can't be edited
  };

  /// `parent`, no stack, and `content`, which takes the focus when it closes, outlive this object.
  MarkPopover(GtkWidget* parent, GtkWidget* content);
  ~MarkPopover();
  MarkPopover(const MarkPopover&) = delete;
  MarkPopover& operator=(const MarkPopover&) = delete;
  /// At a place in the parent's coordinates.
  void show(const GdkRectangle& place, const PageMark& mark, Events events);
  void close() { gtk_popover_popdown(GTK_POPOVER(popover_)); }
  bool isOpen() const { return gtk_widget_get_visible(popover_); }
  /// What it shows or showed last.
  std::string text() const { return gtk_label_get_text(GTK_LABEL(label_)); }
  bool mayEdit() const { return gtk_widget_get_visible(edit_); }
  /// As if the user pressed the button.
  void remove() { finish(events_.remove); }
  void edit() { finish(events_.edit); }

 private:
  void finish(const std::function<void()>& event);

  GtkWidget* content_;
  GtkWidget* popover_;
  GtkWidget* label_;
  GtkWidget* edit_;
  GtkWidget* remove_;
  Events events_;
};

}  // namespace vaelo
