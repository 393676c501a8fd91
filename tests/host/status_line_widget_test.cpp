// SPDX-License-Identifier: GPL-3.0-or-later
#include <adwaita.h>
#include <gtest/gtest.h>

#include "app/drive_status_label_view.h"
#include "host/drive/account_offers.h"
#include "host/gtk/framed_view.h"
#include "host/gtk/mirrored_text.h"
#include "host/gtk/offer_button.h"
#include "host/gtk/pango_graphics.h"
#include "tests/host/painted_frame.h"
#include "tests/support/memory_platform.h"

namespace vaelo {
namespace {

class StatusLineWidgetTest : public testing::Test {
 protected:
  StatusLineWidgetTest() {
    label->setFont(Font::preferred(TextStyle::Caption2));
    view->setPrimaryLabel(label);
    view->setQuotaButton(button);
    view->showLowQuota(false);
    gtk_window_set_child(GTK_WINDOW(window), widget = makeFramedView(view));
    gtk_window_set_default_size(GTK_WINDOW(window), 360, 60);
    gtk_widget_show(window);
    settle();
  }
  ~StatusLineWidgetTest() override { gtk_window_destroy(GTK_WINDOW(window)); }

  void settle() { waitForFrame(window); }
  GtkWidget* text() { return gtk_widget_get_first_child(widget); }
  GtkWidget* press() { return gtk_widget_get_last_child(widget); }
  double middleOf(GtkWidget* part) {
    graphene_rect_t bounds;
    EXPECT_TRUE(gtk_widget_compute_bounds(part, widget, &bounds));
    return static_cast<double>(bounds.origin.x + bounds.size.width / 2);
  }

  MemoryPlatform memory;
  std::vector<std::string> opened;
  std::shared_ptr<DriveStatusLabelView> view = DriveStatusLabelView::initWithFrame({});
  std::shared_ptr<Label> label = std::make_shared<Label>();
  std::shared_ptr<OfferButton> button =
      std::make_shared<OfferButton>(nullptr, [this](const std::string& page) { opened.push_back(page); });
  GtkWidget* window = (adw_init(), gtk_window_new());
  GtkWidget* widget = nullptr;
};

TEST_F(StatusLineWidgetTest, ShowsTheLineInTheMiddleAndFollowsIt) {
  view->setPrimaryLabelText("12 items, 4 GB available");
  settle();
  EXPECT_STREQ(gtk_label_get_text(GTK_LABEL(text())), "12 items, 4 GB available");
  EXPECT_FALSE(gtk_widget_get_visible(press()));
  EXPECT_NEAR(middleOf(text()), gtk_widget_get_width(widget) / 2.0, 1);
  EXPECT_EQ(view->frame().width, gtk_widget_get_width(widget));
}

TEST_F(StatusLineWidgetTest, TheButtonComesUnderTheLineAndIsPressed) {
  int presses = 0;
  button->addAction(ControlEvent::TouchUpInside, [&presses] { ++presses; });
  view->setPrimaryLabelText("12 items");
  view->showLowQuota(true);
  settle();
  ASSERT_TRUE(gtk_widget_get_visible(press()));
  graphene_rect_t line;
  graphene_rect_t below;
  ASSERT_TRUE(gtk_widget_compute_bounds(text(), widget, &line));
  ASSERT_TRUE(gtk_widget_compute_bounds(press(), widget, &below));
  EXPECT_GT(below.origin.y + below.size.height / 2, line.origin.y + line.size.height);
  EXPECT_NEAR(middleOf(press()), gtk_widget_get_width(widget) / 2.0, 1);
  g_signal_emit_by_name(press(), "clicked");
  EXPECT_EQ(presses, 1);
  view->showLowQuota(false);
  EXPECT_FALSE(gtk_widget_get_visible(press()));
}

TEST_F(StatusLineWidgetTest, TextIsAsLargeAsTheUserWants) {
  PangoGraphics graphics;
  const Font font = Font::preferred(TextStyle::Caption2);
  const Size usual = graphics.measure("12 items, 4 GB available", font, 0, 1);
  g_object_set(gtk_settings_get_default(), "gtk-xft-dpi", 2 * 96 * 1024, nullptr);
  const Size large = graphics.measure("12 items, 4 GB available", font, 0, 1);
  PangoAttrList* attributes = attributesOf(font);
  const auto shown = reinterpret_cast<PangoAttrInt*>(
      pango_attr_iterator_get(pango_attr_list_get_iterator(attributes), PANGO_ATTR_ABSOLUTE_SIZE));
  EXPECT_EQ(shown->value, 22 * PANGO_SCALE);
  pango_attr_list_unref(attributes);
  g_object_set(gtk_settings_get_default(), "gtk-xft-dpi", 96 * 1024, nullptr);
  EXPECT_NEAR(large.width, 2 * usual.width, 4);
  EXPECT_NEAR(large.height, 2 * usual.height, 2);
}

TEST_F(StatusLineWidgetTest, NothingIsLaidOutAgainWhenNothingChanged) {
  view->setPrimaryLabelText("12 items");
  settle();
  struct Count : ViewObserver {
    int changes = 0;
    void viewChanged(View&, ViewChange) override { ++changes; }
    void animationWillBegin(View&, const Animation&) override {}
    void animationDidEnd(View&) override {}
    void viewWillBeDestroyed(View&) override {}
  } count;
  ViewObserver* mirror = label->observer();
  label->setObserver(&count);
  gtk_widget_queue_resize(widget);
  settle();
  EXPECT_EQ(count.changes, 0);
  label->setObserver(mirror);
}

TEST_F(StatusLineWidgetTest, AWidgetThatIsGoneLeavesTheView) {
  gtk_window_set_child(GTK_WINDOW(window), nullptr);
  EXPECT_EQ(view->observer(), nullptr);
  EXPECT_EQ(label->observer(), nullptr);
  GtkWidget* second = makeFramedView(view);
  gtk_window_set_child(GTK_WINDOW(window), second);
  view->setPrimaryLabelText("again");
  EXPECT_STREQ(gtk_label_get_text(GTK_LABEL(gtk_widget_get_first_child(second))), "again");
}

TEST_F(StatusLineWidgetTest, TheLinkOpensThePageByItselfUnlessTheProviderWantsToBeAskedFirst) {
  EXPECT_EQ(button->link(), nullptr);
  button->setOffer(
      std::make_shared<ProviderOffer>(1, UpgradeTerms{"https://a.example", {10}, false}, StorageFigures{5, 100}));
  EXPECT_NE(button->link()->action(), UpgradeLink::ActionRunUpgradeFlow);
  EXPECT_TRUE(button->link()->performDefaultAction());
  EXPECT_EQ(opened, std::vector<std::string>{"https://a.example"});
  EXPECT_EQ(button->title(), "Storage Almost Full – Upgrade…");
  button->setOffer(
      std::make_shared<ProviderOffer>(1, UpgradeTerms{"https://b.example", {10}, true}, StorageFigures{0, 100}));
  EXPECT_EQ(button->link()->action(), UpgradeLink::ActionRunUpgradeFlow);
  EXPECT_FALSE(button->link()->performDefaultAction());
  EXPECT_EQ(opened.size(), 1u);
  EXPECT_EQ(button->title(), "Storage Full – Upgrade…");
}

TEST_F(StatusLineWidgetTest, AButtonIsShownForAProvidersOffersAlone) {
  const ProviderOffer offer(1, UpgradeTerms{"https://a.example", {10}, false}, StorageFigures{5, 100});
  EXPECT_TRUE(button->shouldShowForOffer(offer));
  EXPECT_FALSE(button->shouldShowForOffer(MemoryOffer(4)));
}

}  // namespace
}  // namespace vaelo
