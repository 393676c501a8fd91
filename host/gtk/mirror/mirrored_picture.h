// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <gtk/gtk.h>

#include "platform/ui/image_view.h"

namespace vaelo {

/// A picture that fills its frame, which has the picture's shape. Main thread.
class MirroredPicture {
 public:
  /// `view` outlives it.
  explicit MirroredPicture(ImageView& view);
  ~MirroredPicture();
  GtkWidget* widget() { return area_; }
  /// Takes over what changed in the model.
  void update();

 private:
  ImageView& view_;
  GtkWidget* area_;
  ImageRef shown_;
  int times_ = 0;  // its pixels' sides, in those of the picture that is shown
};

}  // namespace vaelo
