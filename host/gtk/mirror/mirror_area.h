// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <gtk/gtk.h>

namespace vaelo {

/// A widget that asks for no room of its own, gives its one child what it gets (but never less than the child must have),
/// and then calls `allocated`. Floating; `allocated` may be null. Main thread.
GtkWidget* makeMirrorArea(GtkWidget* child, void (*allocated)(gpointer data), gpointer data);

}  // namespace vaelo
