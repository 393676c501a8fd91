// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <gtk/gtk.h>

namespace vaelo {

/// Shows the keys that the application knows, over a window. Main thread.
GtkWindow* showShortcutsWindow(GtkWindow* over);

}  // namespace vaelo
