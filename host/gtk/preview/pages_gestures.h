// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <gtk/gtk.h>

#include "host/gtk/preview/pages_canvas.h"

namespace vaelo {

/// Makes pages larger or smaller by pinch, double tap, Ctrl and wheel, and by plus, minus and zero; and walks through them
/// by keys. Main thread.
class PagesGestures {
 public:
  /// `scrolled` holds the canvas' widget; both outlive this object.
  PagesGestures(PagesCanvas& canvas, GtkWidget* scrolled);
  ~PagesGestures();
  PagesGestures(const PagesGestures&) = delete;
  PagesGestures& operator=(const PagesGestures&) = delete;

  /// False when the key means nothing here.
  bool key(guint key, GdkModifierType state);
  /// Between the fitting size and twice as large.
  void doubleTapped(double x, double y);

 private:
  void addPinch();
  void zoomByStep(double steps);
  bool walk(guint key);

  PagesCanvas& canvas_;
  GtkWidget* scrolled_;
  GtkEventController* controllers_[4] = {};
  PagePlace pinched_;
  double pinchedFrom_ = 1;
  double pointerX_ = 0;
  double pointerY_ = 0;
};

}  // namespace vaelo
