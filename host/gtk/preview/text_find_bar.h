// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <gtksourceview/gtksource.h>

#include "host/gtk/preview/find_bar.h"
#include "host/support/glib_ptr.h"

namespace vaelo {

/// A find bar for a text view on a source buffer. Main thread; large texts are searched in slices.
class TextFindBar {
 public:
  /// `view` outlives the bar.
  explicit TextFindBar(GtkTextView* view);
  ~TextFindBar();
  TextFindBar(const TextFindBar&) = delete;
  TextFindBar& operator=(const TextFindBar&) = delete;
  GtkWidget* widget() const { return bar_.widget(); }

  /// The view has another buffer, or is about to have.
  void setBuffer(GtkSourceBuffer* buffer);
  void toggle() { bar_.toggle(); }
  /// False when it is closed already.
  bool close() { return bar_.close(); }

 private:
  void searchChanged(const std::string& text);
  void step(bool forward);
  void found(const GtkTextIter& begin, const GtkTextIter& end);
  void showCount();

  GtkTextView* view_;
  FindBar bar_;
  GRef<GtkSourceSearchSettings> settings_;
  GRef<GtkSourceSearchContext> context_;
  GRef<GCancellable> searching_;
};

}  // namespace vaelo
