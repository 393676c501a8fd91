// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/gtk/item_peek.h"

#include <adwaita.h>

#include "host/gtk/thumbnails/thumbnail_cache.h"
#include "host/support/glib_ptr.h"
#include "tests/host/drive_test_support.h"

namespace vaelo {
namespace {

class ItemPeekTest : public drive_test::DriveTest {
 protected:
  ItemPeekTest() { makeFolder(drive); }
  ~ItemPeekTest() override { gtk_window_destroy(window_); }

  /// What a person sees of the item, which comes from a thread.
  GtkWidget* seen(const std::string& path) {
    GtkWidget* button = makeItemPeek(path, "item.act", 6);
    gtk_window_set_child(window_, button);
    gtk_widget_show(GTK_WIDGET(window_));
    GtkWidget* place = gtk_widget_get_first_child(gtk_button_get_child(GTK_BUTTON(button)));
    while (!gtk_widget_get_next_sibling(place)) g_main_context_iteration(nullptr, TRUE);
    return gtk_widget_get_next_sibling(place);
  }
  std::string textOf(const std::string& path) {
    GtkWidget* widget = seen(path);
    return GTK_IS_LABEL(widget) ? gtk_label_get_text(GTK_LABEL(widget)) : "no text";
  }
  std::string iconOf(const std::string& path) {
    GtkWidget* widget = seen(path);
    if (!GTK_IS_IMAGE(widget)) return "no icon";
    return takeString(g_icon_to_string(gtk_image_get_gicon(GTK_IMAGE(widget))));
  }

  GtkWindow* const window_ = (adw_init(), GTK_WINDOW(gtk_window_new()));
};

TEST_F(ItemPeekTest, ATextShowsHowItBegins) {
  write(drive + "/a.txt", "one\r\ntwo\n\nfour\nfive\nsix\nseven\neight\n");
  EXPECT_EQ(textOf(drive + "/a.txt"), "one\ntwo\n\nfour\nfive\nsix\nseven");
  write(drive + "/b.txt", "no line's end");
  EXPECT_EQ(textOf(drive + "/b.txt"), "no line's end");
}

TEST_F(ItemPeekTest, ATextThatGoesOnIsNotReadToItsEnd) {
  std::string text;
  while (text.size() < 100000) text += "\u65E5";
  for (const std::string before : {"", "a", "ab"}) {
    write(drive + "/a.txt", before + text);
    const std::string shown = textOf(drive + "/a.txt");
    EXPECT_EQ(shown, (before + text).substr(0, shown.size()));
    EXPECT_GT(shown.size(), 2040u);
    EXPECT_LE(shown.size(), 2048u);
  }
}

TEST_F(ItemPeekTest, BytesThatAreNoTextAreShownAsText) {
  write(drive + "/a.txt", "a\xFF\xFE z");
  EXPECT_EQ(textOf(drive + "/a.txt"), "a\uFFFD\uFFFD z");
}

TEST_F(ItemPeekTest, AFolderShowsItsFirstNames) {
  EXPECT_EQ((makeFolder(drive + "/empty"), textOf(drive + "/empty")), "This folder is empty");
  for (const char* name : {"file 10", "file 9", "line\nbreak", ".hidden", "Folder/inside", "1", "2", "3", "4", "5"}) {
    write(drive + "/Plans/" + name, name);
  }
  EXPECT_EQ(textOf(drive + "/Plans"), "Folder\n1\n2\n3\n4\n5\nfile 9");
  std::filesystem::rename(drive + "/Plans/line\nbreak", drive + "/empty/line\nbreak");
  EXPECT_EQ(textOf(drive + "/empty"), "line break");
}

TEST_F(ItemPeekTest, WhatHasNothingToShowHasItsIcon) {
  write(drive + "/.far.pdf.vlopromise", "[Promise]\nName=far.pdf\nSize=9\n");
  EXPECT_NE(iconOf(drive + "/far.pdf").find("application-pdf"), std::string::npos);
  write(drive + "/empty.txt", "");
  EXPECT_NE(iconOf(drive + "/empty.txt").find("text-"), std::string::npos);
  EXPECT_NE(iconOf(drive + "/gone.png"), "no icon");
  ASSERT_EQ(::mkfifo((drive + "/pipe.txt").c_str(), 0600), 0);
  EXPECT_NE(iconOf(drive + "/pipe.txt"), "no icon") << "nobody waits for one to write";
}

TEST_F(ItemPeekTest, APictureIsThatOfTheDesktopsCache) {
  const std::string path = drive + "/a.bin";
  write(path, "binary");
  struct stat info {};
  ASSERT_EQ(::stat(path.c_str(), &info), 0);
  const std::string folder = thumbnailFolderFor(g_get_user_cache_dir(), 256);
  const auto name = thumbnailNameOf(path);
  ASSERT_TRUE(name);
  const std::string file = folder + "/" + name->file;
  const GRef<GdkPixbuf> picture(gdk_pixbuf_new(GDK_COLORSPACE_RGB, FALSE, 8, 200, 100));
  gdk_pixbuf_fill(picture.get(), 0x336699ff);
  ASSERT_TRUE(storeThumbnail(file, picture.get(), name->uri, info.st_mtim.tv_sec));
  EXPECT_TRUE(GTK_IS_PICTURE(seen(path)));
  ::unlink(file.c_str());
}

// A folder on a disk that doesn't answer must not keep the menu, nor come back to one that is gone.
TEST_F(ItemPeekTest, ItMayGoBeforeItSees) {
  write(drive + "/a.txt", "one");
  for (int i = 0; i < 50; ++i) g_object_unref(g_object_ref_sink(makeItemPeek(drive + "/a.txt", "item.act", 6)));
  EXPECT_EQ(textOf(drive + "/a.txt"), "one");
}

}  // namespace
}  // namespace vaelo
