// SPDX-License-Identifier: GPL-3.0-or-later
// Views of real documents in a window, each through the table of kinds.
#include <adwaita.h>
#include <gdk-pixbuf/gdk-pixbuf.h>
#include <gtest/gtest.h>

#include "host/gtk/preview/document_view.h"
#include "tests/host/list_test_folder.h"

namespace vaelo {
namespace {

using list_test::TestFolder;
using list_test::waitUntil;

class PreviewDocumentsTest : public testing::Test {
 protected:
  void SetUp() override {
    if (!gtk_init_check()) GTEST_SKIP() << "no display";
    adw_init();
    window_ = gtk_window_new();
    gtk_window_set_default_size(GTK_WINDOW(window_), 400, 600);
    gtk_window_present(GTK_WINDOW(window_));
  }
  void TearDown() override {
    if (window_) gtk_window_set_child(GTK_WINDOW(window_), nullptr);
    view_.reset();
    if (window_) gtk_window_destroy(GTK_WINDOW(window_));
  }
  void open(const std::string& name, const std::string& type) {
    shown_ = 0;
    failure_.clear();
    if (view_) gtk_window_set_child(GTK_WINDOW(window_), nullptr);
    DocumentViewEvents events;
    events.shown = [this] { ++shown_; };
    events.failed = [this](const std::string& sentence) { failure_ = sentence; };
    events.progress = [](const std::string&) {};
    view_ = makeDocumentView({folder_.path() + "/" + name, name, type, false}, std::move(events));
    ASSERT_NE(view_, nullptr);
    gtk_window_set_child(GTK_WINDOW(window_), view_->widget());
    ASSERT_TRUE(waitUntil([this] { return shown_ > 0 || !failure_.empty(); })) << name;
  }
  void writePicture(const std::string& name, const char* format, int width, int height) {
    GdkPixbuf* pixbuf = gdk_pixbuf_new(GDK_COLORSPACE_RGB, FALSE, 8, width, height);
    gdk_pixbuf_fill(pixbuf, 0x336699ff);
    ASSERT_TRUE(gdk_pixbuf_save(pixbuf, (folder_.path() + "/" + name).c_str(), format, nullptr, nullptr));
    g_object_unref(pixbuf);
  }

  TestFolder folder_;
  GtkWidget* window_ = nullptr;
  std::unique_ptr<DocumentView> view_;
  int shown_ = 0;
  std::string failure_;
};

TEST_F(PreviewDocumentsTest, PicturesOfEachFormatAreShown) {
  for (const auto& [name, format, type] :
       {std::tuple("a.png", "png", "image/png"), std::tuple("a.jpg", "jpeg", "image/jpeg"),
        std::tuple("a.tiff", "tiff", "image/tiff"), std::tuple("a.bmp", "bmp", "image/bmp")}) {
    writePicture(name, format, 300, 200);
    open(name, type);
    EXPECT_EQ(failure_, "") << name;
  }
  folder_.write("a.svg",
                "<svg xmlns='http://www.w3.org/2000/svg' width='40' height='30'><rect width='40' height='30'/></svg>");
  open("a.svg", "image/svg+xml");
  EXPECT_EQ(failure_, "");
}

TEST_F(PreviewDocumentsTest, ADamagedPictureSaysSo) {
  folder_.write("a.png", "This is no picture.");
  open("a.png", "image/png");
  EXPECT_EQ(failure_, "This document is damaged and can’t be shown.");
  folder_.write("b.svg", "<svg xmlns='http://www.w3.org/2000/svg'><g><g>");
  open("b.svg", "image/svg+xml");
  EXPECT_NE(failure_, "");
}

TEST_F(PreviewDocumentsTest, APictureThatClaimsAnEnormousSizeSaysSo) {
  // A header of 100,000 by 100,000 pixels without any of them.
  const unsigned char header[] = {0x89, 'P',  'N',  'G', 13, 10,   26,   10, 0, 0, 0, 13, 'I',  'H',  'D',  'R', 0,
                                  1,    0x86, 0xa0, 0,   1,  0x86, 0xa0, 8,  2, 0, 0, 0,  0xb4, 0x5c, 0xd4, 0xbf};
  folder_.write("big.png", std::string(reinterpret_cast<const char*>(header), sizeof header));
  open("big.png", "image/png");
  EXPECT_NE(failure_, "");
}

TEST_F(PreviewDocumentsTest, TextIsShownAndBytesAreNot) {
  folder_.write("a.txt", "One line\n");
  open("a.txt", "text/plain");
  EXPECT_EQ(failure_, "");
  folder_.write("b.txt", std::string(4096, '\0'));
  open("b.txt", "text/plain");
  EXPECT_NE(failure_, "");
}

TEST_F(PreviewDocumentsTest, LeavingWhileItLoadsIsHarmless) {
  writePicture("a.png", "png", 3000, 2000);
  for (int i = 0; i < 20; ++i) {
    DocumentViewEvents events;
    events.shown = [] {};
    events.failed = [](const std::string&) {};
    events.progress = [](const std::string&) {};
    makeDocumentView({folder_.path() + "/a.png", "a.png", "image/png", false}, std::move(events));
  }
  open("a.png", "image/png");
  EXPECT_EQ(failure_, "");
}

}  // namespace
}  // namespace vaelo
