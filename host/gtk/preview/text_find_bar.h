// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <adwaita.h>
#include <gtksourceview/gtksource.h>

#include "host/support/glib_ptr.h"

namespace vaelo {

/// A search bar that finds text in a text view on a source buffer: as one types, onwards with Enter and Ctrl+G, and back
/// with Shift. Main thread; large texts are searched in slices.
class TextFindBar {
 public:
  /// `view` outlives the bar.
  explicit TextFindBar(GtkTextView* view);
  ~TextFindBar();
  TextFindBar(const TextFindBar&) = delete;
  TextFindBar& operator=(const TextFindBar&) = delete;
  GtkWidget* widget() const { return bar_; }

  /// The view has another buffer, or is about to have.
  void setBuffer(GtkSourceBuffer* buffer);
  void toggle();
  /// False when it is closed already.
  bool close();

 private:
  void searchChanged();
  void step(bool forward);
  void found(const GtkTextIter& begin, const GtkTextIter& end);
  void showCount();

  GtkTextView* view_;
  GtkWidget* bar_;
  GtkWidget* entry_;
  GtkWidget* count_;
  GRef<GtkSourceSearchSettings> settings_;
  GRef<GtkSourceSearchContext> context_;
  GRef<GCancellable> searching_;
};

}  // namespace vaelo
