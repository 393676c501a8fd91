// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/support/own_folder.h"

#include <adwaita.h>
#include <gtest/gtest.h>

namespace vaelo {
namespace {

TEST(OwnFolderTest, TheSignsThatRowsDrawAreInTheIcons) {
  adw_init();
  const std::string icons = ownFolder("icons", "share/icons", "hicolor/scalable/apps/com.marrow.VaeloDrive.svg");
  ASSERT_NE(icons, "");
  GtkIconTheme* theme = gtk_icon_theme_new();
  const char* const nowhere[] = {nullptr};
  gtk_icon_theme_set_search_path(theme, nowhere);
  gtk_icon_theme_set_resource_path(theme, nowhere);
  EXPECT_FALSE(gtk_icon_theme_has_icon(theme, "vaelo-drive-not-downloaded-symbolic"));
  gtk_icon_theme_add_search_path(theme, "/usr/share/icons");  // which says where themes have their icons
  gtk_icon_theme_add_search_path(theme, icons.c_str());
  EXPECT_TRUE(gtk_icon_theme_has_icon(theme, "vaelo-drive-not-downloaded-symbolic"));
  g_object_unref(theme);
}

TEST(OwnFolderTest, WhatIsNowhereHasNoFolder) { EXPECT_EQ(ownFolder("icons", "share/icons", "hicolor/no such file"), ""); }

}  // namespace
}  // namespace vaelo
