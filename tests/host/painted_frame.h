// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <gtk/gtk.h>

namespace vaelo {

/// Runs the main loop until a frame of the window was drawn after the last change.
inline void waitForFrame(GtkWidget* window) {
  bool drawn = false;
  gtk_widget_queue_draw(window);
  g_signal_connect(gtk_widget_get_frame_clock(window), "after-paint",
                   G_CALLBACK(+[](GdkFrameClock*, bool* flag) { *flag = true; }), &drawn);
  while (!drawn) g_main_context_iteration(nullptr, TRUE);
  g_signal_handlers_disconnect_by_data(gtk_widget_get_frame_clock(window), &drawn);
}

}  // namespace vaelo
