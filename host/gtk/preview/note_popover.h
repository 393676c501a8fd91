// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <gtk/gtk.h>

#include <functional>
#include <string>

namespace vaelo {

/// Asks for the text of a note. What was written is kept however it closes, unless the user gives it up. Main thread.
class NotePopover {
 public:
  /// `parent` outlives this object. A stack, whose children are told to screen readers as pages, can't be one.
  /// `content` takes the focus when it closes; it outlives this object too.
  NotePopover(GtkWidget* parent, GtkWidget* content);
  ~NotePopover();
  NotePopover(const NotePopover&) = delete;
  NotePopover& operator=(const NotePopover&) = delete;
  /// At a place in the parent's coordinates; `written` gets a text that is not empty. One that is open is finished first.
  /// `text` is that of a note that is there already.
  void ask(const GdkRectangle& place, std::function<void(const std::string&)> written, const std::string& text = "");
  bool isOpen() const { return gtk_widget_get_visible(popover_); }
  /// Keeps what was written.
  void finish() { gtk_popover_popdown(GTK_POPOVER(popover_)); }
  void giveUp();
  std::string text() const;
  /// As if it was written by the user.
  void setText(const std::string& text);

 private:
  void closed();
  void followWindow();
  void leaveWindow();
  void fitIntoWindow();

  GtkWidget* content_;
  GtkWidget* popover_;
  GtkWidget* text_;
  GtkWidget* done_;
  std::function<void(const std::string&)> written_;
  GdkRectangle place_ = {};       // that was asked for, of the parent
  GdkSurface* window_ = nullptr;  // while it is open
  gulong layout_ = 0;
};

}  // namespace vaelo
