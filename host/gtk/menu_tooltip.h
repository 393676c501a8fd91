// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <gtk/gtk.h>

namespace vaelo {

/// The tooltip of a button that has its menu or popover already. It shows while that is closed: over it, it would hide the
/// first of what can be chosen, and a finger that stays on the button doesn't take it away.
inline void setTooltipWhileClosed(GtkMenuButton* button, const char* text) {
  gtk_widget_set_tooltip_text(GTK_WIDGET(button), text);
  GtkPopover* popover = gtk_menu_button_get_popover(button);
  const auto show = [](GtkWidget* shown, GtkWidget* on) { gtk_widget_set_has_tooltip(on, !gtk_widget_get_visible(shown)); };
  for (const char* signal : {"show", "hide"}) {
    g_signal_connect_object(popover, signal, G_CALLBACK(+show), button, G_CONNECT_AFTER);
  }
}

}  // namespace vaelo
