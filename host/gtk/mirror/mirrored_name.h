// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <gtk/gtk.h>

#include "host/gtk/mirrored_field.h"

namespace vaelo {

/// A field whose text, while it isn't edited, is shortened in its middle where it is too long: the toolkit's own fields end
/// anywhere then, as if that were all. Main thread.
class MirroredName {
 public:
  explicit MirroredName(TextField& field);
  ~MirroredName();
  GtkWidget* widget() { return overlay_; }
  /// Takes over what changed in the model.
  void update();

 private:
  gboolean placeText(GtkWidget* child, GdkRectangle* at);

  TextField& model_;
  MirroredField field_;
  GtkWidget* overlay_;
  GtkWidget* text_;
};

}  // namespace vaelo
