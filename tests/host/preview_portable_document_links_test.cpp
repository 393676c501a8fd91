// SPDX-License-Identifier: GPL-3.0-or-later
#include "tests/host/preview_portable_document_screen_test.h"

namespace vaelo {
namespace {

using portable_document_test::writeDocument;

TEST(PagesLinks, ReadsOnlyWholeLines) {
  const auto page = pageLinkIn("page 1.00 2.00 3.00 4.00 7 120.50");
  ASSERT_TRUE(page);
  EXPECT_EQ(page->page, 7);
  EXPECT_EQ(page->top, 120.5);
  EXPECT_EQ(pageLinkIn("note 1 2 3 4 two words")->text, "two words");
  for (const char* line :
       {"", "page 1 2 3 4", "page 1 2 3 4 -1 0", "note 1 2 3", "note 1 2 3 4 ", "link 1 2 x 4 a", "else 1 2 3 4 5"}) {
    EXPECT_FALSE(pageLinkIn(line)) << line;
  }
}

class PortableDocumentLinksTest : public portable_document_test::ScreenTest {
 protected:
  void openLinks() {
    writeDocument(path(), 9, 400, 600, [](cairo_t* context, int page) {
      if (page == 5) cairo_tag_begin(context, CAIRO_TAG_DEST, "name='there'");
      if (page == 5) cairo_tag_end(context, CAIRO_TAG_DEST);
      if (page > 0) return;
      const char* links[] = {"dest='there'", "uri='https://127.0.0.1/place'", "uri='file:///etc/passwd'"};
      for (int i = 0; i < 3; ++i) {
        cairo_tag_begin(context, CAIRO_TAG_LINK, links[i]);
        cairo_move_to(context, 40, 120 + 40 * i);
        cairo_show_text(context, "A link");
        cairo_tag_end(context, CAIRO_TAG_LINK);
      }
    });
    open(true);
  }
  void click(double x, double y) {
    const auto [left, top] = at(0, x, y);
    screen_->click(left, top);
  }
};

TEST_F(PortableDocumentLinksTest, ALinkIntoTheDocumentLeadsThere) {
  openLinks();
  click(300, 400);
  click(60, 115);
  EXPECT_TRUE(waitUntil([this] { return screen_->canvas().currentPage() == 5; }));
}

TEST_F(PortableDocumentLinksTest, ALinkOutOfItSaysWhereItLeadsAndOnlyTheWebIsOpened) {
  openLinks();
  click(60, 155);
  EXPECT_TRUE(waitUntil([this] { return screen_->linkPopover().text() == "https://127.0.0.1/place"; }));
  EXPECT_TRUE(screen_->linkPopover().mayOpen());
  click(60, 195);
  EXPECT_TRUE(waitUntil([this] { return screen_->linkPopover().text() == "file:///etc/passwd"; }));
  EXPECT_FALSE(screen_->linkPopover().mayOpen());
}

TEST_F(PortableDocumentLinksTest, ANoteIsReadAtOnceAndAgainAfterItWasSaved) {
  openLinks();
  screen_->markup().askForNote(at(0, 200, 300).first, at(0, 200, 300).second);
  screen_->markup().note().setText("Mind the bridge");
  screen_->markup().note().finish();
  click(210, 310);
  EXPECT_EQ(screen_->markup().popover().text(), "Mind the bridge");
  close();
  PortableDocumentMarks::finishAll();
  open();
  click(210, 310);
  EXPECT_TRUE(waitUntil([this] { return screen_->linkPopover().text() == "Mind the bridge"; }));
}

}  // namespace
}  // namespace vaelo
