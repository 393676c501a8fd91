// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/gtk/focus_return.h"

namespace vaelo {

void returnFocusWhenClosed(GtkWidget* popover) {
  GtkRoot* root = gtk_widget_get_root(popover);
  GtkWidget* before = root ? gtk_root_get_focus(root) : nullptr;
  if (!before) return;
  auto* kept = g_new0(GWeakRef, 1);
  g_weak_ref_init(kept, before);
  g_signal_connect_data(
      popover, "closed", G_CALLBACK(+[](GtkWidget*, GWeakRef* held) {
        auto* widget = static_cast<GtkWidget*>(g_weak_ref_get(held));
        if (!widget) return;
        if (gtk_widget_get_mapped(widget)) gtk_widget_grab_focus(widget);
        g_object_unref(widget);
      }),
      kept,
      [](gpointer held, GClosure*) {
        g_weak_ref_clear(static_cast<GWeakRef*>(held));
        g_free(held);
      },
      GConnectFlags(0));
}

}  // namespace vaelo
