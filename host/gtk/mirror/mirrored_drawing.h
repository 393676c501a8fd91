// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <gtk/gtk.h>

#include "platform/ui/view.h"

namespace vaelo {

/// A canvas for a view that draws itself. Main thread.
class MirroredDrawing {
 public:
  /// `view` outlives it.
  explicit MirroredDrawing(View& view);
  ~MirroredDrawing();
  GtkWidget* widget() { return area_; }
  /// Draws anew.
  void update();

 private:
  GtkWidget* area_;
};

}  // namespace vaelo
