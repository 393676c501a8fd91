// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <gtk/gtk.h>

#include <memory>

#include "platform/ui/view.h"

namespace vaelo {

/// The widget that shows what one view shows. Main thread.
class MirroredContent {
 public:
  virtual ~MirroredContent() = default;
  virtual GtkWidget* widget() = 0;
  /// Takes over what changed in the view.
  virtual void update() = 0;
};

/// Null for views that only hold others.
std::unique_ptr<MirroredContent> makeMirroredContent(View& view);

}  // namespace vaelo
