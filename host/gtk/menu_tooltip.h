// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <gtk/gtk.h>

namespace vaelo {

/// Keeps the tooltip of a button away while a menu or popover of it shows: over that it would hide the first of what can be
/// chosen, and a finger that stays on the button doesn't take it away.
inline void hideTooltipWhileShown(GtkWidget* button, GtkWidget* popover) {
  const auto show = [](GtkWidget* shown, GtkWidget* on) { gtk_widget_set_has_tooltip(on, !gtk_widget_get_visible(shown)); };
  for (const char* signal : {"show", "hide"}) {
    g_signal_connect_object(popover, signal, G_CALLBACK(+show), button, G_CONNECT_AFTER);
  }
}

/// The tooltip of a button that has its menu or popover already. It shows while that is closed.
inline void setTooltipWhileClosed(GtkMenuButton* button, const char* text) {
  gtk_widget_set_tooltip_text(GTK_WIDGET(button), text);
  hideTooltipWhileShown(GTK_WIDGET(button), GTK_WIDGET(gtk_menu_button_get_popover(button)));
}

}  // namespace vaelo
