// SPDX-License-Identifier: GPL-3.0-or-later
#include <gtest/gtest.h>

#include "host/gtk/preview/portable_document_screen.h"
#include "tests/host/preview_portable_document_support.h"

namespace vaelo {
namespace {

using list_test::TestFolder;
using list_test::waitUntil;
using portable_document_test::smallDocument;
using portable_document_test::writeDocument;

/// Real documents in the real decoder's process, in a window.
class PortableDocumentViewTest : public testing::Test {
 protected:
  void SetUp() override {
    if (!gtk_init_check()) GTEST_SKIP() << "no display";
    adw_init();
    window_ = gtk_window_new();
    gtk_window_set_default_size(GTK_WINDOW(window_), 424, 700);
    gtk_window_present(GTK_WINDOW(window_));
  }
  void TearDown() override {
    screen_.reset();
    if (window_) gtk_window_destroy(GTK_WINDOW(window_));
  }

  void open(bool mayBeEdited = false) {
    PreviewedDocument document{folder_.path() + "/a.pdf", "a.pdf", "application/pdf", mayBeEdited};
    DocumentViewEvents events;
    events.shown = [this] { ++shown_; };
    events.failed = [this](const std::string& sentence) { failure_ = sentence; };
    events.shouldSave = [] { return true; };
    screen_ = std::make_unique<PortableDocumentScreen>(document, std::move(events));
    gtk_window_set_child(GTK_WINDOW(window_), screen_->widget());
    ASSERT_TRUE(waitUntil([this] { return (shown_ > 0 && screen_->canvas().height() > 0) || !failure_.empty(); }));
  }

  TestFolder folder_;
  GtkWidget* window_ = nullptr;
  std::unique_ptr<PortableDocumentScreen> screen_;
  int shown_ = 0;
  std::string failure_;
};

TEST_F(PortableDocumentViewTest, ShowsADocument) {
  writeDocument(folder_.path() + "/a.pdf", 3);
  open();
  EXPECT_EQ(failure_, "");
  EXPECT_EQ(screen_->canvas().layout().count(), 3);
  EXPECT_DOUBLE_EQ(screen_->canvas().layout().size(0).width, 400);
}

TEST_F(PortableDocumentViewTest, LearnsTheSizesOfAllPages) {
  writeDocument(folder_.path() + "/a.pdf", 2000);
  open();
  EXPECT_EQ(screen_->canvas().layout().count(), 2000);
  screen_->canvas().showPage(1999);
  EXPECT_EQ(screen_->canvas().currentPage(), 1999);
}

TEST_F(PortableDocumentViewTest, SaysWhyADocumentIsNotShown) {
  folder_.write("a.pdf", "This is no portable document.");
  open();
  EXPECT_EQ(failure_, "This document is damaged and can’t be shown.");
}

TEST_F(PortableDocumentViewTest, ADocumentReadAnewStaysWhereItWas) {
  writeDocument(folder_.path() + "/a.pdf", 30);
  open();
  screen_->canvas().showPage(20, 100);
  writeDocument(folder_.path() + "/a.pdf", 40);
  screen_->refresh();
  ASSERT_TRUE(waitUntil([this] { return screen_->canvas().layout().count() == 40; }));
  EXPECT_EQ(screen_->canvas().placeAt(0, 0).page, 20);
  EXPECT_NEAR(screen_->canvas().placeAt(0, 0).y, 100, 1);
}

}  // namespace
}  // namespace vaelo
