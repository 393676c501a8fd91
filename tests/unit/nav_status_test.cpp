// SPDX-License-Identifier: GPL-3.0-or-later
#include <gmock/gmock.h>

#include "tests/unit/app_fixture.h"

namespace vaelo {
namespace {

using NavStatusTest = AppFixture;

class QuotaListener : public QuotaFetcherDelegate {
 public:
  void quotaFetcherDidUpdateValue(QuotaFetcher&, std::uint64_t freeBytes) override { values.push_back(freeBytes); }
  std::vector<std::uint64_t> values;
};

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
}

TEST_F(NavStatusTest, AFetchedValueReachesTheLine) {
  setFreeBytes(5'368'709'120);
  loadNav();
  topList()->itemsLoaded({addFile("a.txt")});
  runAllQueues();
  EXPECT_EQ(nav->quotaBytes(), 5'368'709'120u);
  EXPECT_EQ(nav->quotaFetcher()->freeBytes(), 5'368'709'120u);
  EXPECT_EQ(statusText(), nav->toolbarStatusText(1));
  EXPECT_TRUE(loggedStarting("DEBUG", "updated quota at "));
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

TEST_F(NavStatusTest, TheFetcherAsksAtOnceAndThenEveryInterval) {
  const auto fetcher = QuotaFetcher::init();
  const auto listener = std::make_shared<QuotaListener>();
  setFreeBytes(7);
  fetcher->setDelegate(listener);
  fetcher->runWithInterval(300);
  runAllQueues();
  EXPECT_EQ(quotaFetches(), 1);
  EXPECT_EQ(listener->values, std::vector<std::uint64_t>{7});
  advance(std::chrono::seconds(299));
  EXPECT_EQ(quotaFetches(), 1);
  advance(std::chrono::seconds(2));
  EXPECT_EQ(quotaFetches(), 2);
  fetcher->fetchNow();
  runAllQueues();
  EXPECT_EQ(quotaFetches(), 3);
}

TEST_F(NavStatusTest, ASecondIntervalReplacesTheFirst) {
  const auto fetcher = QuotaFetcher::init();
  fetcher->runWithInterval(10);
  fetcher->runWithInterval(100);
  runAllQueues();
  const int before = quotaFetches();
  advance(std::chrono::seconds(99));
  EXPECT_EQ(quotaFetches(), before);
}

TEST_F(NavStatusTest, ADroppedFetcherAsksNoMore) {
  auto fetcher = QuotaFetcher::init();
  fetcher->runWithInterval(10);
  runAllQueues();
  const int before = quotaFetches();
  fetcher = nullptr;
  advance(std::chrono::seconds(60));
  EXPECT_EQ(quotaFetches(), before);
}

TEST_F(NavStatusTest, NothingIsFetchedInTheBackground) {
  const auto fetcher = QuotaFetcher::init();
  resignActive();
  EXPECT_FALSE(fetcher->canFetch());
  EXPECT_TRUE(logged("INFO", "Got WillResignActiveNotification (quota)"));
  fetcher->performFetch();
  runAllQueues();
  EXPECT_EQ(quotaFetches(), 0);
  EXPECT_TRUE(logged("DEBUG", "Not fetching quota: backgrounded."));
  becomeActive();
  EXPECT_TRUE(fetcher->canFetch());
  EXPECT_TRUE(logged("INFO", "Got DidBecomeActiveNotification (quota)"));
}

TEST_F(NavStatusTest, NothingIsFetchedWithoutAnAccount) {
  signOut();
  const auto fetcher = QuotaFetcher::init();
  bool completed = false;
  fetcher->fetchUserQuotaWithCompletion([&completed](std::int64_t, const std::optional<Error>&) { completed = true; });
  runAllQueues();
  EXPECT_FALSE(completed);
  EXPECT_TRUE(logged("INFO", "Not fetching quota. Ubiquity is not enabled"));
}

TEST_F(NavStatusTest, AFailedFetchKeepsThePreviousValue) {
  const auto fetcher = QuotaFetcher::init();
  const auto listener = std::make_shared<QuotaListener>();
  fetcher->setDelegate(listener);
  const Error error{CloudDocumentsErrorDomain, 3, {}, "offline", {}};
  failQuota(error);
  fetcher->performFetch();
  runAllQueues();
  EXPECT_TRUE(listener->values.empty());
  EXPECT_TRUE(logged("WARNING", "can't update quota: " + error.description()));
}

}  // namespace
}  // namespace vaelo
