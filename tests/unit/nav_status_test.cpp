// SPDX-License-Identifier: GPL-3.0-or-later
#include <gmock/gmock.h>

#include <set>

#include "tests/unit/app_fixture.h"

namespace vaelo {
namespace {

using NavStatusTest = AppFixture;

TEST_F(NavStatusTest, TheLineIsCentredInTheToolbar) {
  loadNav();
  const auto& items = topList()->toolbarItems();
  ASSERT_EQ(items.size(), 3u);
  EXPECT_EQ(items[0]->systemItem(), SystemItem::FlexibleSpace);
  EXPECT_EQ(items[1]->customView(), statusBarOf(*topList())->labelsView());
  EXPECT_EQ(items[2]->systemItem(), SystemItem::FlexibleSpace);
  const auto& label = *statusBarOf(*topList())->labelsView()->primaryLabel();
  EXPECT_EQ(label.font(), Font::preferred(TextStyle::Caption2));
  EXPECT_FALSE(label.opaque());
  EXPECT_EQ(statusBarOf(*topList())->delegate().get(), nav.get());
}

TEST_F(NavStatusTest, AListKeepsItsStatusBar) {
  loadNav();
  const auto bar = statusBarOf(*topList());
  EXPECT_EQ(topList()->attachment("_VaeloDriveAppStatusBar"), bar);
  nav->initNewListController(topList());
  EXPECT_EQ(statusBarOf(*topList()), bar);
}

TEST_F(NavStatusTest, TheLineWaitsForAListToReportItsItems) {
  loadNav();
  nav->updateStatusUI(nullptr);
  EXPECT_EQ(statusText(), "");
  EXPECT_FALSE(nav->pickerIsAlive());
  topList()->itemsLoaded({addFile("a.txt"), addFile("b.txt")});
  EXPECT_TRUE(nav->pickerIsAlive());
  EXPECT_EQ(statusText(), nav->toolbarStatusText(2));
}

TEST_F(NavStatusTest, FreeSpaceIsShownOnceItIsKnownBeItZero) {
  loadNav();
  EXPECT_FALSE(nav->okToShowQuota());
  const std::string items = nav->toolbarStatusText(3);
  EXPECT_EQ(items, platform().formatting.localizedCount(".DICT.ITEMS.%d", 3));
  nav->quotaFetcherDidUpdateValue(*nav->quotaFetcher(), 0);
  EXPECT_TRUE(nav->okToShowQuota());
  EXPECT_EQ(nav->toolbarStatusText(3), platform().formatting.filled(platform().formatting.localizedString("%1$@, %2$@"),
                                                                    {items, nav->quotaAvailableString()}));
}

TEST_F(NavStatusTest, FreeSpaceIsCountedIn1024s) {
  loadNav();
  nav->quotaFetcherDidUpdateValue(*nav->quotaFetcher(), 7 * 1024);
  EXPECT_EQ(nav->quotaAvailableString(), "7 KB (7) available");
  EXPECT_EQ(nav->toolbarStatusText(1), "items: 1, 7 KB (7) available");
  // 1010 * 1024: the number has no grouping, which would end it after the 1.
  nav->quotaFetcherDidUpdateValue(*nav->quotaFetcher(), 1'034'240);
  EXPECT_EQ(nav->quotaAvailableString(), "1,010 KB (1010) available");
  // 1.5 * 1024 * 1024 * 1024
  nav->quotaFetcherDidUpdateValue(*nav->quotaFetcher(), 1'610'612'736);
  EXPECT_EQ(nav->quotaAvailableString(), "1.5 GB (1.5) available");
  // 2^64 - 1 is 16 EB but for a byte.
  nav->quotaFetcherDidUpdateValue(*nav->quotaFetcher(), ~std::uint64_t{0});
  EXPECT_EQ(nav->quotaAvailableString(), "16 EB (16) available");
}

TEST_F(NavStatusTest, AFetchedValueReachesTheLine) {
  setFreeBytes(5'368'709'120);
  loadNav();
  topList()->itemsLoaded({addFile("a.txt")});
  runAllQueues();
  EXPECT_EQ(nav->quotaBytes(), 5'368'709'120u);
  EXPECT_EQ(nav->quotaFetcher()->freeBytes(), 5'368'709'120u);
  EXPECT_EQ(statusText(), nav->toolbarStatusText(1));
  ASSERT_TRUE(nav->lastQuotaFetch().has_value());
  EXPECT_EQ(*nav->lastQuotaFetch(), platform().queues.now());
  EXPECT_TRUE(
      logged("DEBUG", "updated quota at " + Value(*nav->lastQuotaFetch()).description() + ": 5368709120 bytes avail"));
}

TEST_F(NavStatusTest, SigningOutForgetsTheBytesButNotThatTheyWereKnown) {
  setFreeBytes(1024);
  loadNav();
  becomeActive();
  runAllQueues();
  signOut();
  identityChanged();
  EXPECT_EQ(nav->quotaBytes(), 0u);
  EXPECT_TRUE(nav->okToShowQuota());
}

TEST_F(NavStatusTest, AReportFromAListBelowOnlyBringsThePickerToLife) {
  loadNav();
  const auto root = topList();
  nav->pushViewController(makeList(addFolder("Plans")), false);
  root->itemsLoaded({addFile("a.txt")});
  EXPECT_TRUE(nav->pickerIsAlive());
  EXPECT_EQ(statusText(), "");
}

TEST_F(NavStatusTest, TheCountIsLoggedWhenItChanges) {
  loadNav();
  std::vector<URL> items(7, addFile("a.txt"));
  topList()->itemsLoaded(items);
  topList()->itemsLoaded(items);
  EXPECT_EQ(log().count("DEBUG", "DLC items changed, count is 7"), 1u);
  topList()->itemsLoaded({});
  EXPECT_TRUE(logged("DEBUG", "DLC items changed, count is 0"));
}

TEST_F(NavStatusTest, ACountThatAnotherListHadIsNotLoggedAgain) {
  loadNav();
  const std::vector<URL> items(8, addFile("a.txt"));
  topList()->itemsLoaded(items);
  nav->pushViewController(makeList(addFolder("Plans")), false);
  topList()->itemsLoaded(items);
  EXPECT_EQ(log().count("DEBUG", "DLC items changed, count is 8"), 1u);
  EXPECT_EQ(statusText(), "items: 8");
}

TEST_F(NavStatusTest, EditModeShowsWhatIsSelectedAndHidesTheWayBack) {
  loadNav();
  const std::vector<URL> items = {addFile("a.txt"), addFile("b.txt")};
  topList()->setTitle("Drive");
  topList()->itemsLoaded(items);
  nav->initNewListController(topList());
  nav->setEditModeAndUpdateUIForViewController(true, topList());
  EXPECT_TRUE(nav->editMode());
  EXPECT_TRUE(topList()->editing());
  EXPECT_TRUE(topList()->navigationItem().hidesBackButton());
  EXPECT_EQ(topList()->navigationItem().title(), platform().formatting.localizedString("Select Items"));
  topList()->setSelectedItems(items);
  EXPECT_EQ(topList()->navigationItem().title(), platform().formatting.localizedCount(".DICT.ITEMS_SELECTED.%d", 2));
  EXPECT_TRUE(logged("DEBUG", "DLC selected item count is 2"));
  nav->setEditModeAndUpdateUIForViewController(false, topList());
  EXPECT_EQ(topList()->navigationItem().title(), "Drive");
  EXPECT_FALSE(topList()->navigationItem().hidesBackButton());
  EXPECT_EQ(topList()->toolbarItems(), statusBarOf(*topList())->toolbarItems());
}

TEST_F(NavStatusTest, AListBelowIsUpdatedItself) {
  loadNav();
  const auto root = topList();
  root->itemsLoaded({addFile("a.txt"), addFile("b.txt")});
  nav->pushViewController(makeList(addFolder("Plans")), false);
  statusBarOf(*root)->setStatusText("");
  nav->updateStatusUI(root);
  EXPECT_EQ(statusBarOf(*root)->labelsView()->primaryLabel()->text(), "items: 2");
}

TEST_F(NavStatusTest, UpdatingTheLineUpdatesItsOfferAndNoTitle) {
  setOffer(2);
  loadNav();
  topList()->itemsLoaded({});
  statusBarOf(*topList())->showUpgradeOffer(nullptr);
  topList()->navigationItem().setTitle("Drive");
  nav->updateStatusUI(nullptr);
  EXPECT_EQ(statusBarOf(*topList())->labelsView()->quotaButton()->offer(), nav->upgradeOffer());
  EXPECT_EQ(topList()->navigationItem().title(), "Drive");
}

TEST_F(NavStatusTest, EachValueHasItsTime) {
  loadNav();
  nav->quotaFetcherDidUpdateValue(*nav->quotaFetcher(), 1);
  const Date first = *nav->lastQuotaFetch();
  advance(std::chrono::seconds(300));
  nav->quotaFetcherDidUpdateValue(*nav->quotaFetcher(), 1);
  EXPECT_EQ(*nav->lastQuotaFetch() - first, std::chrono::seconds(300));
}

TEST_F(NavStatusTest, TheLineAndItsOfferFollowInEditModeToo) {
  loadNav();
  topList()->itemsLoaded({addFile("a.txt")});
  nav->setEditModeAndUpdateUIForViewController(true, topList());
  const auto bar = statusBarOf(*topList());
  bar->setStatusText("");
  bar->showUpgradeOffer(std::make_shared<MemoryOffer>(1));
  nav->updateStatusUI(topList());
  EXPECT_EQ(statusText(), "items: 1");
  EXPECT_EQ(bar->labelsView()->quotaButton()->offer(), nullptr);
}

/// Notes each view that changed.
struct ChangedViews : ViewObserver {
  void viewChanged(View& view, ViewChange) override { changed.insert(&view); }
  void animationWillBegin(View&, const Animation&) override {}
  void animationDidEnd(View&) override {}
  void viewWillBeDestroyed(View&) override {}
  void watch(const ViewRef& view) {
    watched.push_back(view);
    view->setObserver(this);
    for (const ViewRef& subview : view->subviews()) watch(subview);
  }
  ~ChangedViews() override {
    for (const ViewRef& view : watched) view->setObserver(nullptr);
  }
  std::vector<ViewRef> watched;
  std::set<const View*> changed;
};

TEST_F(NavStatusTest, AValueTouchesOnlyTheStatusBar) {
  loadNav();
  nav->pushViewController(makeList(addFolder("Plans")), false);
  topList()->itemsLoaded({addFile("a.txt")});
  runAllQueues();
  const DriveStatusLabelView& line = *statusBarOf(*topList())->labelsView();
  ChangedViews views;
  views.watch(nav->view());
  for (const ViewControllerRef& screen : nav->viewControllers()) {
    views.watch(screen->view());
    views.watch(statusBarOf(*std::dynamic_pointer_cast<DocumentListController>(screen))->labelsView());
  }
  int others = 0;
  const auto count = [&others](auto&&...) { ++others; };
  const auto listToken = topList()->listChanged().connect(count);
  const auto barToken = topList()->navigationItem().changed().connect(count);
  const auto screenToken = topList()->changed().connect(count);
  nav->quotaFetcherDidUpdateValue(*nav->quotaFetcher(), 7 * 1024);
  ASSERT_TRUE(views.changed.erase(line.primaryLabel().get()));
  views.changed.erase(&line);
  EXPECT_TRUE(views.changed.empty()) << views.changed.size() << " more, of " << views.watched.size();
  EXPECT_EQ(others, 0);
}

}  // namespace
}  // namespace vaelo
