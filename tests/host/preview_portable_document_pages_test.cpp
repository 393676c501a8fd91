// SPDX-License-Identifier: GPL-3.0-or-later
#include <gtest/gtest.h>

#include "host/gtk/preview/pages_canvas.h"
#include "host/gtk/preview/pages_gestures.h"

namespace vaelo {
namespace {

TEST(PagesLayout, PagesStandBelowEachOtherAndCentred) {
  PagesLayout layout;
  layout.setCount(3);
  layout.setSizes(0, {{100, 200}, {50, 100}, {100, 300}});
  EXPECT_DOUBLE_EQ(layout.width(2), 200 + 2 * PagesLayout::Gap);
  EXPECT_DOUBLE_EQ(layout.height(2), 1200 + 4 * PagesLayout::Gap);
  const PageArea second = layout.area(1, 2, 1000);
  EXPECT_DOUBLE_EQ(second.x, 450);
  EXPECT_DOUBLE_EQ(second.y, 400 + 2 * PagesLayout::Gap);
  EXPECT_DOUBLE_EQ(layout.area(1, 2, 10).x, PagesLayout::Gap + 50);
  EXPECT_EQ(layout.pageAt(0, 2), 0);
  EXPECT_EQ(layout.pageAt(second.y, 2), 1);
  EXPECT_EQ(layout.pageAt(second.y - 1, 2), 0);
  EXPECT_EQ(layout.pageAt(1e9, 2), 2);
}

TEST(PagesLayout, PagesOfUnknownSizeAreLikeTheLastKnownOne) {
  PagesLayout layout;
  layout.setCount(5);
  layout.setSizes(0, {{100, 200}, {300, 400}});
  EXPECT_DOUBLE_EQ(layout.size(4).width, 300);
  layout.setSizes(3, {{10, 20}, {30, 40}, {50, 60}});
  EXPECT_DOUBLE_EQ(layout.size(2).width, 300);
  EXPECT_DOUBLE_EQ(layout.size(4).width, 30);
  EXPECT_EQ(layout.count(), 5);
}

/// A canvas that was given 424 by 500 pixels.
class PagesCanvasTest : public testing::Test {
 protected:
  void SetUp() override {
    if (!gtk_init_check()) GTEST_SKIP() << "no display";
    canvas_ =
        std::make_unique<PagesCanvas>(PagesCanvas::Events{[](GtkSnapshot*, int, const PageArea&) {}, [this] { ++moves_; }});
    canvas_->setAdjustment(true, gtk_adjustment_new(0, 0, 0, 0, 0, 0));
    canvas_->setAdjustment(false, gtk_adjustment_new(0, 0, 0, 0, 0, 0));
    canvas_->setCount(100);
    canvas_->setSizes(0, {{400, 600}});
    canvas_->allocated(424, 500);
  }

  std::unique_ptr<PagesCanvas> canvas_;
  int moves_ = 0;
};

TEST_F(PagesCanvasTest, FillsTheWidthUntilTheUserZooms) {
  EXPECT_DOUBLE_EQ(canvas_->zoom(), 1);
  canvas_->showPage(50, 100);
  canvas_->allocated(224, 500);
  EXPECT_DOUBLE_EQ(canvas_->zoom(), 0.5);
  EXPECT_EQ(canvas_->placeAt(0, 0).page, 50);
  EXPECT_NEAR(canvas_->placeAt(0, 0).y, 100, 1);
  canvas_->zoomTo(2, 10, 10);
  canvas_->allocated(424, 500);
  EXPECT_DOUBLE_EQ(canvas_->zoom(), 2);
  canvas_->fit();
  EXPECT_DOUBLE_EQ(canvas_->zoom(), 1);
}

TEST_F(PagesCanvasTest, ZoomKeepsThePointUnderTheFingers) {
  canvas_->showPage(20);
  const PagePlace before = canvas_->placeAt(300, 200);
  canvas_->zoomTo(3, 300, 200);
  const PagePlace after = canvas_->placeAt(300, 200);
  EXPECT_EQ(after.page, before.page);
  EXPECT_NEAR(after.x, before.x, 0.01);
  EXPECT_NEAR(after.y, before.y, 0.01);
}

TEST_F(PagesCanvasTest, OnlyPagesInSightAreVisible) {
  EXPECT_EQ(canvas_->visiblePages(), (std::pair{0, 0}));
  EXPECT_EQ(canvas_->currentPage(), 0);
  canvas_->showPage(40, 400);
  EXPECT_EQ(canvas_->visiblePages(), (std::pair{40, 41}));
  EXPECT_EQ(canvas_->currentPage(), 41);
  canvas_->showPage(99);
  EXPECT_EQ(canvas_->currentPage(), 99);
}

TEST_F(PagesCanvasTest, SizesThatArriveLaterDoNotMoveWhatIsRead) {
  canvas_->showPage(60, 30);
  canvas_->setSizes(10, std::vector<PageSize>(20, PageSize{400, 100}));
  EXPECT_EQ(canvas_->placeAt(0, 0).page, 60);
  EXPECT_NEAR(canvas_->placeAt(0, 0).y, 30, 1);
}

TEST_F(PagesCanvasTest, RevealScrollsNoFurtherThanNeeded) {
  canvas_->showPage(10);
  const double top = canvas_->areaOf(10).y;
  canvas_->reveal(10, 50, 100, 150, 120);
  EXPECT_DOUBLE_EQ(canvas_->areaOf(10).y, top);
  canvas_->reveal(30, 50, 300, 150, 320);
  const PageArea area = canvas_->areaOf(30);
  EXPECT_GT(area.y + 300, 0);
  EXPECT_LT(area.y + 320, 500);
}

TEST_F(PagesCanvasTest, WhatIsRevealedIsNotBelowThePageNumber) {
  canvas_->showPage(10);
  const double bottom = (canvas_->height() - canvas_->areaOf(10).y - 55) / canvas_->zoom();
  canvas_->reveal(10, 50, bottom - 20, 150, bottom);
  EXPECT_LE(canvas_->areaOf(10).y + bottom * canvas_->zoom(), canvas_->height() - 60);
}

TEST_F(PagesCanvasTest, KeysWalkAndZoom) {
  GtkWidget* scrolled = GTK_WIDGET(g_object_ref_sink(gtk_scrolled_window_new()));
  {
    PagesGestures gestures(*canvas_, scrolled);
    const auto none = static_cast<GdkModifierType>(0);
    EXPECT_TRUE(gestures.key(GDK_KEY_End, none));
    EXPECT_EQ(canvas_->currentPage(), 99);
    EXPECT_TRUE(gestures.key(GDK_KEY_Home, none));
    EXPECT_EQ(canvas_->currentPage(), 0);
    EXPECT_TRUE(gestures.key(GDK_KEY_Page_Down, none));
    EXPECT_TRUE(gestures.key(GDK_KEY_Page_Down, none));
    EXPECT_EQ(canvas_->currentPage(), 1);
    EXPECT_TRUE(gestures.key(GDK_KEY_plus, GDK_CONTROL_MASK));
    EXPECT_GT(canvas_->zoom(), 1.1);
    EXPECT_TRUE(gestures.key(GDK_KEY_0, GDK_CONTROL_MASK));
    EXPECT_DOUBLE_EQ(canvas_->zoom(), 1);
    EXPECT_FALSE(gestures.key(GDK_KEY_Left, GDK_ALT_MASK));
    gestures.doubleTapped(100, 100);
    EXPECT_DOUBLE_EQ(canvas_->zoom(), 2);
    gestures.doubleTapped(100, 100);
    EXPECT_DOUBLE_EQ(canvas_->zoom(), 1);
  }
  g_object_unref(scrolled);
}

}  // namespace
}  // namespace vaelo
