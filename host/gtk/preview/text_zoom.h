// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <gtk/gtk.h>

#include "host/support/glib_ptr.h"

namespace vaelo {

/// Makes the letters of a text view larger or smaller by pinch, Ctrl and wheel, and Ctrl with plus, minus and zero.
class TextZoom {
 public:
  /// `view` goes with this object, or its controllers are not called any more.
  explicit TextZoom(GtkWidget* view);
  ~TextZoom();
  TextZoom(const TextZoom&) = delete;
  TextZoom& operator=(const TextZoom&) = delete;
  double scale() const { return scale_; }
  void setScale(double scale);

 private:
  bool key(guint key);

  GRef<GtkWidget> view_;
  GRef<GtkCssProvider> provider_;
  GtkEventController* controllers_[3];
  double scale_ = 1;
  double pinchedFrom_ = 1;
};

}  // namespace vaelo
