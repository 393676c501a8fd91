// SPDX-License-Identifier: GPL-3.0-or-later
#include "tests/host/preview_portable_document_screen_test.h"

namespace vaelo {
namespace {

using portable_document_test::writeDocument;

class PortableDocumentFindTest : public portable_document_test::ScreenTest {
 protected:
  void find(const std::string& text) {
    screen_->find().search(text, screen_->canvas().currentPage());
    ASSERT_TRUE(waitUntil([this] { return !screen_->find().isSearching(); }));
  }
  std::string countShown() { return gtk_label_get_text(GTK_LABEL(screen_->findBar().count())); }
};

TEST_F(PortableDocumentFindTest, FindsEveryPlaceAndScrollsToTheFirst) {
  writeDocument(path(), 40);
  open();
  find("page 3");  // and 30 to 39
  EXPECT_EQ(screen_->find().count(), 11);
  EXPECT_EQ(screen_->find().position(), 1);
  EXPECT_EQ(screen_->canvas().currentPage(), 2);
  ASSERT_EQ(screen_->find().placesOn(29).size(), 1U);
  // "This is " goes before it in the line, whose letters stand on a base line 60 points from the top.
  const PageRect& place = screen_->find().placesOn(29).front();
  EXPECT_GT(place.left, 80);
  EXPECT_LT(place.right, 220);
  EXPECT_GT(place.top, 30);
  EXPECT_LT(place.bottom, 75);
}

TEST_F(PortableDocumentFindTest, IgnoresCaseAndSaysWhenThereIsNothing) {
  writeDocument(path(), 3);
  open();
  ASSERT_TRUE(screen_->toggleFind());
  find("THIS");
  EXPECT_EQ(screen_->find().count(), 3);
  EXPECT_EQ(countShown(), "1 of 3");
  find("nowhere");
  EXPECT_EQ(countShown(), "Not found");
  find("");
  EXPECT_EQ(countShown(), "");
}

TEST_F(PortableDocumentFindTest, BeginsAtThePageThatIsReadAndGoesRound) {
  writeDocument(path(), 10);
  open();
  screen_->canvas().showPage(5);
  const int page = screen_->canvas().currentPage();
  find("This is");
  EXPECT_EQ(screen_->find().count(), 10);
  EXPECT_EQ(screen_->find().position(), page + 1);
  for (int i = 0; i < 10 - page; ++i) screen_->find().step(true);
  EXPECT_EQ(screen_->find().position(), 1);
  EXPECT_EQ(screen_->canvas().visiblePages().first, 0);
  screen_->find().step(false);
  EXPECT_EQ(screen_->find().position(), 10);
  EXPECT_EQ(screen_->canvas().visiblePages().second, 9);
}

TEST_F(PortableDocumentFindTest, APlaceIsFoundOnceThoughTheSearchGoesRound) {
  writeDocument(path(), 10);
  open();
  screen_->canvas().showPage(5);
  find("page 8");
  EXPECT_EQ(screen_->find().count(), 1);
}

TEST_F(PortableDocumentFindTest, AnotherTextGivesTheFirstUp) {
  writeDocument(path(), 400);
  open();
  screen_->find().search("page", 0);
  find("page 77");
  EXPECT_EQ(screen_->find().count(), 1);
  EXPECT_EQ(screen_->find().text(), "page 77");
}

TEST_F(PortableDocumentFindTest, TheBarFindsWithEnterAndClosesWithEscape) {
  writeDocument(path(), 4);
  open();
  EXPECT_FALSE(screen_->closeFind());
  ASSERT_TRUE(screen_->toggleFind());
  gtk_editable_set_text(GTK_EDITABLE(screen_->findBar().entry()), "page");
  g_signal_emit_by_name(screen_->findBar().entry(), "activate");
  ASSERT_TRUE(waitUntil([this] { return countShown() == "1 of 4"; }));
  g_signal_emit_by_name(screen_->findBar().entry(), "activate");
  EXPECT_EQ(countShown(), "2 of 4");
  g_signal_emit_by_name(screen_->findBar().entry(), "previous-match");
  EXPECT_EQ(countShown(), "1 of 4");
  EXPECT_TRUE(screen_->closeFind());
  EXPECT_EQ(screen_->find().count(), 0);
  EXPECT_FALSE(screen_->closeFind());
}

TEST_F(PortableDocumentFindTest, ADocumentReadAnewIsSearchedAnew) {
  writeDocument(path(), 3);
  open();
  find("page");
  EXPECT_EQ(screen_->find().count(), 3);
  writeDocument(path(), 5);
  screen_->refresh();
  EXPECT_TRUE(waitUntil([this] { return screen_->find().count() == 5 && !screen_->find().isSearching(); }));
}

}  // namespace
}  // namespace vaelo
