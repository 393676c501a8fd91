// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <gtk/gtk.h>

#include "host/gtk/preview/markup_bar.h"

namespace vaelo {

/// The buttons of a document that can be searched and marked, for the header bar: two of them, or a menu with both where a
/// phone's header bar has no room for one more. Main thread.
class DocumentButtons {
 public:
  /// `data` goes to `find`; the bar outlives this object, and this object what it makes.
  DocumentButtons(MarkupBar& bar, GCallback find, gpointer data) : bar_(bar), find_(find), data_(data) {}
  ~DocumentButtons();
  DocumentButtons(const DocumentButtons&) = delete;
  DocumentButtons& operator=(const DocumentButtons&) = delete;
  GtkWidget* make();
  /// The page is so many pixels wide.
  void fit(int width);

 private:
  GtkWidget* makeMenu();
  void show();

  MarkupBar& bar_;
  GCallback find_;
  gpointer data_;
  GtkWidget* both_ = nullptr;  // of the last ones made, null when they are gone
  GtkWidget* menu_ = nullptr;
  bool narrow_ = false;
  guint idle_ = 0;
};

}  // namespace vaelo
