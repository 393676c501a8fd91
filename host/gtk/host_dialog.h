// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <gtk/gtk.h>

namespace vaelo {

/// A screen of the host's own that is shown in a window over the others while it is presented. Main thread.
class HostDialog {
 public:
  virtual ~HostDialog() = default;
  /// Makes the window, which whoever presents the screen shows and destroys. Closing it is to dismiss the screen.
  virtual GtkWindow* makeDialog(GtkWindow* over) = 0;
};

}  // namespace vaelo
