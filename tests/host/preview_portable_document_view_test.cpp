// SPDX-License-Identifier: GPL-3.0-or-later
#include "tests/host/preview_portable_document_screen_test.h"

namespace vaelo {
namespace {

using portable_document_test::writeDocument;

class PortableDocumentViewTest : public portable_document_test::ScreenTest {};

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

TEST_F(PortableDocumentViewTest, EachPageThatShowsIsAPartInItsPlace) {
  writeDocument(folder_.path() + "/a.pdf", 40);
  open();
  PagesCanvas& canvas = screen_->canvas();
  const auto partsAre = [&canvas] {
    const auto [first, last] = canvas.visiblePages();
    int page = first;
    for (GtkWidget* part = gtk_widget_get_first_child(canvas.widget()); part; part = gtk_widget_get_next_sibling(part)) {
      if (!gtk_widget_get_visible(part)) continue;
      graphene_rect_t place;
      const PageArea area = canvas.areaOf(page++);
      if (!gtk_widget_compute_bounds(part, canvas.widget(), &place)) return false;
      if (std::abs(static_cast<double>(place.origin.y) - area.y) > 1) return false;
      if (std::abs(static_cast<double>(place.size.height) - area.height) > 2) return false;
    }
    return page == last + 1;
  };
  EXPECT_TRUE(waitUntil(partsAre));
  canvas.showPage(20, 300);
  EXPECT_TRUE(waitUntil(partsAre));
  canvas.zoomTo(0.2, 0, 0);
  EXPECT_TRUE(waitUntil(partsAre)) << "of more pages than before";
  canvas.fit();
  EXPECT_TRUE(waitUntil(partsAre)) << "of fewer";
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
