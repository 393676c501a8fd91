// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/gtk/scrolled_windows.h"

#include <gtest/gtest.h>
#include <gtk/gtk.h>

namespace vaelo {

namespace {

bool isKnownToSettings(gpointer widget) {
  return g_signal_handler_find(gtk_settings_get_default(), G_SIGNAL_MATCH_DATA, 0, 0, nullptr, nullptr, widget) != 0;
}

TEST(ScrolledWindows, LeaveNothingBehind) {
  if (!gtk_init_check()) GTEST_SKIP() << "no display";
  mendScrolledWindows();
  GtkWidget* window = gtk_window_new();
  GtkWidget* scrolled = gtk_scrolled_window_new();
  gtk_window_set_child(GTK_WINDOW(window), scrolled);
  gtk_window_present(GTK_WINDOW(window));
  EXPECT_TRUE(isKnownToSettings(scrolled));
  gtk_window_set_child(GTK_WINDOW(window), nullptr);
  EXPECT_FALSE(isKnownToSettings(scrolled));
  gtk_window_destroy(GTK_WINDOW(window));
}

}  // namespace

}  // namespace vaelo
