// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/gtk/menu_tooltip.h"

#include <gtest/gtest.h>

namespace vaelo {

namespace {

TEST(MenuTooltip, ShowsWhileTheMenuIsClosed) {
  GtkWidget* window = gtk_window_new();
  GtkWidget* button = gtk_menu_button_new();
  gtk_window_set_child(GTK_WINDOW(window), button);
  GtkWidget* popover = gtk_popover_new();
  gtk_menu_button_set_popover(GTK_MENU_BUTTON(button), popover);
  setTooltipWhileClosed(GTK_MENU_BUTTON(button), "Main Menu");
  EXPECT_STREQ(gtk_widget_get_tooltip_text(button), "Main Menu");
  EXPECT_TRUE(gtk_widget_get_has_tooltip(button));
  gtk_window_present(GTK_WINDOW(window));
  gtk_popover_popup(GTK_POPOVER(popover));
  EXPECT_FALSE(gtk_widget_get_has_tooltip(button));
  gtk_popover_popdown(GTK_POPOVER(popover));
  EXPECT_TRUE(gtk_widget_get_has_tooltip(button));
  EXPECT_STREQ(gtk_widget_get_tooltip_text(button), "Main Menu");
  gtk_window_destroy(GTK_WINDOW(window));
}

TEST(MenuTooltip, StaysAwayWhileAPopoverOfTheButtonShows) {
  GtkWidget* window = gtk_window_new();
  GtkWidget* button = gtk_button_new();
  gtk_window_set_child(GTK_WINDOW(window), button);
  gtk_widget_set_tooltip_text(button, "Share");
  gtk_window_present(GTK_WINDOW(window));
  GtkWidget* popover = gtk_popover_new();
  gtk_widget_set_parent(popover, window);
  hideTooltipWhileShown(button, popover);
  EXPECT_TRUE(gtk_widget_get_has_tooltip(button));
  gtk_popover_popup(GTK_POPOVER(popover));
  EXPECT_FALSE(gtk_widget_get_has_tooltip(button));
  gtk_widget_set_visible(popover, FALSE);
  EXPECT_TRUE(gtk_widget_get_has_tooltip(button));
  gtk_widget_unparent(popover);
  gtk_window_destroy(GTK_WINDOW(window));
}

}  // namespace

}  // namespace vaelo
