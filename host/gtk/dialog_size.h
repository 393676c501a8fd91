// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <gtk/gtk.h>

#include <algorithm>

namespace vaelo {

/// Gives a dialog a phone's width, and the height that it wants unless the window below it is lower, as on a phone that lies
/// on its side. Answers the height.
inline int setDialogSize(GtkWindow* dialog, GtkWindow* over, int height) {
  constexpr int width = 360;
  const int room = gtk_widget_get_height(GTK_WIDGET(over));
  const int taken = room > 0 ? std::min(height, room) : height;
  gtk_window_set_default_size(dialog, width, taken);
  return taken;
}

}  // namespace vaelo
