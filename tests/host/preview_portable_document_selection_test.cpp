// SPDX-License-Identifier: GPL-3.0-or-later
#include "tests/host/preview_portable_document_screen_test.h"

namespace vaelo {
namespace {

using portable_document_test::writeDocument;

/// Two lines of letters, ten points each way; the second one is written from right to left.
PageText twoLines() {
  std::vector<PageRect> boxes;
  for (int i = 0; i < 6; ++i) boxes.push_back({i * 10.0, 0, i * 10.0 + 10, 10});
  for (int i = 0; i < 3; ++i) boxes.push_back({50 - i * 10.0, 20, 60 - i * 10.0, 30});
  return {boxes, "ab c,\nאבג"};
}

TEST(PageText, ACaretStandsBetweenLetters) {
  const PageText text = twoLines();
  EXPECT_EQ(text.caretAt(1, 5), 0U);
  EXPECT_EQ(text.caretAt(9, 5), 1U);
  EXPECT_EQ(text.caretAt(900, 5), 5U) << "behind the comma, not behind the end of the line";
  EXPECT_EQ(text.caretAt(59, 25), 6U) << "right of the first letter of a line that is read leftwards";
  EXPECT_EQ(text.caretAt(0, 25), 9U);
  EXPECT_EQ(PageText().caretAt(1, 1), 0U);
}

TEST(PageText, WordsEndAtGapsSignsAndLines) {
  const PageText text = twoLines();
  EXPECT_EQ(text.text(text.wordAt(5, 5)), "ab");
  EXPECT_EQ(text.text(text.wordAt(35, 5)), "c");
  EXPECT_EQ(text.text(text.wordAt(45, 5)), ",");
  EXPECT_EQ(text.text(text.wordAt(45, 25)), "אבג");
}

TEST(PageText, ARangeHasARectangleForEachLine) {
  const std::vector<PageRect> rects = twoLines().rects({1, 8});
  ASSERT_EQ(rects.size(), 2U);
  EXPECT_EQ(rects[0].left, 10);
  EXPECT_EQ(rects[0].right, 50);
  EXPECT_EQ(rects[1].left, 40);
  EXPECT_EQ(rects[1].right, 60);
}

TEST(PageText, HasAsManyLettersAsPlaces) {
  EXPECT_EQ(PageText({{0, 0, 1, 1}}, "abc").size(), 1U);
  EXPECT_EQ(PageText({{0, 0, 1, 1}, {1, 0, 2, 1}}, "a\xff").size(), 1U);
}

class PortableDocumentSelectionTest : public portable_document_test::ScreenTest {
 protected:
  std::string selected() {
    std::optional<std::string> text;
    waitUntil([&] { return (text = screen_->selecting().selection().text()).has_value(); });
    return text.value_or("still read");
  }
  void openTwoLines() {
    writeDocument(path(), 3, 400, 600, [](cairo_t* context, int) {
      cairo_move_to(context, 40, 100);
      cairo_show_text(context, "The second line.");
    });
    open();
  }
};

TEST_F(PortableDocumentSelectionTest, ADragSelectsFromLetterToLetter) {
  openTwoLines();
  dragFrom(at(0, 30, 55), at(0, 390, 55));
  EXPECT_EQ(selected(), "This is page 1.");
  dragFrom(at(0, 390, 95), at(0, 30, 55));
  EXPECT_EQ(selected(), "This is page 1.\nThe second line.");
  EXPECT_EQ(screen_->selecting().selection().rectsOn(0).size(), 2U);
  screen_->press(at(0, 100, 55).first, at(0, 100, 55).second, 1);
  screen_->release(false);
  EXPECT_EQ(selected(), "");
}

TEST_F(PortableDocumentSelectionTest, ADragGoesOnOverPages) {
  openTwoLines();
  dragFrom(at(0, 30, 95), at(1, 390, 55));
  EXPECT_EQ(selected(), "The second line.\nThis is page 2.");
}

TEST_F(PortableDocumentSelectionTest, ASecondPressSelectsWords) {
  openTwoLines();
  dragFrom(at(0, 60, 95), at(0, 60, 95), 2);
  EXPECT_EQ(selected(), "The");
  dragFrom(at(0, 60, 95), at(0, 120, 95), 2);
  EXPECT_EQ(selected(), "The second");
}

TEST_F(PortableDocumentSelectionTest, KeysSelectThePageAndCopyIt) {
  openTwoLines();
  EXPECT_TRUE(screen_->selecting().key(GDK_KEY_a, GDK_CONTROL_MASK));
  EXPECT_TRUE(screen_->selecting().key(GDK_KEY_c, GDK_CONTROL_MASK)) << "before the text is read";
  EXPECT_EQ(selected().substr(0, 32), "This is page 1.\nThe second line.");
  EXPECT_EQ(clipboard().substr(0, 32), "This is page 1.\nThe second line.");
  EXPECT_TRUE(screen_->closeFind());
  EXPECT_EQ(selected(), "");
  EXPECT_FALSE(screen_->closeFind());
}

TEST_F(PortableDocumentSelectionTest, APageWithoutTextHasNothingToSelect) {
  folder_.write("a.pdf", portable_document_test::smallDocument());
  open();
  screen_->selecting().selectPage(0);
  EXPECT_EQ(selected(), "");
  EXPECT_FALSE(screen_->selecting().clear());
}

}  // namespace
}  // namespace vaelo
