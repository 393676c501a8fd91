// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/gtk/popover_parent.h"

namespace vaelo {

namespace {

void leaveParent(GtkWidget* popover) {
  if (gtk_widget_get_parent(popover)) gtk_widget_unparent(popover);
}

// What was chosen in it may still be on its way.
void leaveParentSoon(GtkWidget* popover) {
  g_idle_add_full(
      G_PRIORITY_LOW,
      [](gpointer held) -> gboolean {
        leaveParent(GTK_WIDGET(held));
        return G_SOURCE_REMOVE;
      },
      g_object_ref(popover), g_object_unref);
}

}  // namespace

void setPopoverParent(GtkWidget* popover, GtkWidget* parent) {
  gtk_widget_set_parent(popover, parent);
  g_signal_connect_object(parent, "destroy", G_CALLBACK(leaveParent), popover, G_CONNECT_SWAPPED);
  g_signal_connect(popover, "closed", G_CALLBACK(leaveParentSoon), nullptr);
}

}  // namespace vaelo
