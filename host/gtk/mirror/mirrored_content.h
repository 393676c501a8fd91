// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <gtk/gtk.h>

#include <memory>

#include "platform/ui/view.h"

namespace vaelo {

/// The widget that shows what a view itself shows, without its subviews: a text, a picture, a button, a field, a drawing.
/// Main thread.
class MirroredContent {
 public:
  virtual ~MirroredContent() = default;
  /// Whoever puts it somewhere takes a reference of its own.
  virtual GtkWidget* widget() = 0;
  /// Takes over what changed in the view.
  virtual void update() = 0;
};

/// Null for a view that shows nothing itself.
std::unique_ptr<MirroredContent> makeMirroredContent(View& view);

}  // namespace vaelo
