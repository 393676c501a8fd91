// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <gtk/gtk.h>

#include <functional>

#include "host/gtk/preview/pages_selection.h"
#include "host/support/glib_ptr.h"

namespace vaelo {

/// Selecting text on pages, and what can be done with it: by keys and from a menu. Main thread.
class PagesSelecting {
 public:
  struct Events {
    std::function<const PageText*(int page)> textOf;  ///< null while it is being read, after which textRead() is called
    std::function<bool()> mayHighlight;
    std::function<void(int page, std::vector<PageRect> lines)> highlight;
  };

  /// The menu belongs to `host`, no stack, which like the canvas outlives this object.
  PagesSelecting(PagesCanvas& canvas, GtkWidget* host, Events events);
  ~PagesSelecting();
  PagesSelecting(const PagesSelecting&) = delete;
  PagesSelecting& operator=(const PagesSelecting&) = delete;
  const PagesSelection& selection() const { return selection_; }

  /// From a place on the canvas on; `presses` is how often it was pressed there.
  void begin(double x, double y, int presses);
  void extend(double x, double y);
  void selectPage(int page);
  /// False when nothing was selected.
  bool clear();
  void copy();
  /// Marks what is selected, and takes the selection away.
  void highlight();
  /// At a place on the canvas; a word there is selected when nothing is.
  void showMenu(double x, double y);
  void textRead();
  /// False when the key means nothing here.
  bool key(guint key, GdkModifierType state);

 private:
  void whenRead(std::function<void(const std::string& text)> then);
  bool isEmpty() const;

  PagesCanvas& canvas_;
  GtkWidget* host_;
  Events events_;
  PagesSelection selection_;
  std::function<void(const std::string& text)> whenRead_;
  GRef<GSimpleActionGroup> actions_;
  GtkWidget* menu_;
};

}  // namespace vaelo
