// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <gtk/gtk.h>

#include "platform/ui/button.h"

namespace vaelo {

/// A button with a title. Main thread.
class MirroredButton {
 public:
  /// `button` outlives it.
  explicit MirroredButton(Button& button);
  ~MirroredButton();
  GtkWidget* widget() { return button_; }
  /// Takes over what changed in the model.
  void update();

 private:
  Button& model_;
  GtkWidget* button_;
  GtkWidget* title_;
};

}  // namespace vaelo
