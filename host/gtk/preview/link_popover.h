// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <gtk/gtk.h>

#include <string>

namespace vaelo {

/// Shows what a note says, or where a link out of a document leads before it is followed. Main thread.
class LinkPopover {
 public:
  /// `parent`, no stack, and `content`, which takes the focus when it closes, outlive this object.
  LinkPopover(GtkWidget* parent, GtkWidget* content);
  ~LinkPopover();
  LinkPopover(const LinkPopover&) = delete;
  LinkPopover& operator=(const LinkPopover&) = delete;
  /// At a place in the parent's coordinates.
  void showNote(const GdkRectangle& place, const std::string& text);
  void showAddress(const GdkRectangle& place, const std::string& address);
  /// What it shows or showed last.
  std::string text() const { return gtk_label_get_text(GTK_LABEL(label_)); }
  bool mayOpen() const { return gtk_widget_get_visible(open_); }

 private:
  void show(const GdkRectangle& place, const std::string& text, bool mayOpen);
  void open();

  GtkWidget* content_;
  GtkWidget* popover_;
  GtkWidget* label_;
  GtkWidget* open_;
};

}  // namespace vaelo
