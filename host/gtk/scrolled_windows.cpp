// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/gtk/scrolled_windows.h"

#include <gtk/gtk.h>

namespace vaelo {

namespace {

gboolean unrealized(GSignalInvocationHint*, guint, const GValue* values, gpointer) {
  gpointer widget = g_value_get_object(values);
  if (GTK_IS_SCROLLED_WINDOW(widget))
    g_signal_handlers_disconnect_by_data(gtk_widget_get_settings(GTK_WIDGET(widget)), widget);
  return TRUE;
}

}  // namespace

void mendScrolledWindows() {
  g_type_class_unref(g_type_class_ref(GTK_TYPE_WIDGET));  // which makes the signal
  g_signal_add_emission_hook(g_signal_lookup("unrealize", GTK_TYPE_WIDGET), 0, unrealized, nullptr, nullptr);
}

}  // namespace vaelo
