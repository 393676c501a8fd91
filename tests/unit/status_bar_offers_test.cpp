// SPDX-License-Identifier: GPL-3.0-or-later
#include <gmock/gmock.h>

#include "tests/support/memory_upgrade_button.h"
#include "tests/unit/app_fixture.h"

namespace vaelo {
namespace {

struct PressHeard : DocumentListControllerStatusBarDelegate {
  int presses = 0;
  void upgradeStorageButtonPressed() override { ++presses; }
};

class StatusBarOffersTest : public AppFixture {
 protected:
  void makeBar(const StorageOfferRef& first) { bar->createStatusBarButtonPressDelegate(first, heard); }
  const DriveStatusLabelView& line() { return *bar->labelsView(); }
  MemoryUpgradeButton& button() { return static_cast<MemoryUpgradeButton&>(*line().quotaButton()); }
  static bool showsButton(const DocumentListController& list) {
    const DriveStatusLabelView& shown = *statusBarOf(list)->labelsView();
    EXPECT_EQ(shown.quotaButton()->hidden(), !shown.showLowQuota());
    return shown.showLowQuota();
  }

  std::shared_ptr<PressHeard> heard = std::make_shared<PressHeard>();
  std::shared_ptr<DocumentListControllerStatusBar> bar = std::make_shared<DocumentListControllerStatusBar>();
  StorageOfferRef offer = std::make_shared<MemoryOffer>(2);
};

TEST_F(StatusBarOffersTest, TheLineIsFramedLikeTheSystemsStatusBar) {
  memory.screens.deviceShown.statusBar = {0, 0, 360, 24};
  makeBar(nullptr);
  EXPECT_EQ(line().frame(), (Rect{0, 0, 360, 24}));
  EXPECT_EQ(line().subviews(), (std::vector<ViewRef>{line().primaryLabel(), line().quotaButton()}));
  const Label& label = *line().primaryLabel();
  EXPECT_EQ(label.font(), Font::preferred(TextStyle::Caption2));
  EXPECT_EQ(label.textColor(), Color::black());
  EXPECT_EQ(label.backgroundColor(), std::nullopt);
  EXPECT_FALSE(label.opaque());
  EXPECT_EQ(button().frame().size(), (Size{47, 29}));
}

TEST_F(StatusBarOffersTest, WithoutAnOfferThereIsNoButton) {
  makeBar(nullptr);
  EXPECT_EQ(button().offer(), nullptr);
  EXPECT_TRUE(button().hidden());
}

TEST_F(StatusBarOffersTest, AnOfferAtTheStartShowsTheButton) {
  makeBar(offer);
  EXPECT_EQ(button().offer(), offer);
  EXPECT_FALSE(button().hidden());
}

TEST_F(StatusBarOffersTest, AnOfferThatCallsForNoButtonShowsNone) {
  memory.screens.hidesUpgrades = true;
  makeBar(offer);
  EXPECT_EQ(button().offer(), offer);
  EXPECT_TRUE(button().hidden());
  bar->showUpgradeOffer(std::make_shared<MemoryOffer>(3));
  EXPECT_TRUE(button().hidden());
}

TEST_F(StatusBarOffersTest, TheButtonTakesAnotherOfferOnly) {
  makeBar(offer);
  bar->showUpgradeOffer(offer);
  EXPECT_EQ(button().offersSet, 0);
  const auto other = std::make_shared<MemoryOffer>(2);
  bar->showUpgradeOffer(other);
  EXPECT_EQ(button().offersSet, 1);
  EXPECT_EQ(button().offer(), other);
  bar->showUpgradeOffer(nullptr);
  EXPECT_EQ(button().offer(), nullptr);
  EXPECT_TRUE(button().hidden());
}

TEST_F(StatusBarOffersTest, ALinkThatActsByItselfNeedsNobodyElse) {
  makeBar(offer);
  button().target->performs = true;
  button().sendActions(ControlEvent::TouchUpInside);
  EXPECT_EQ(button().target->performed, 1);
  EXPECT_EQ(heard->presses, 0);
  EXPECT_EQ(userActions(), std::vector<std::string>{"Pressed Upgrade Storage"});
  EXPECT_TRUE(logged("INFO", "================= Pressed Upgrade Storage"));
  EXPECT_TRUE(logged("INFO", "UpgradeStorage button pressed, link.action=3"));
  EXPECT_TRUE(logged("INFO", "UpgradeStorage button pressed, launched default action (Manage Storage?)"));
}

TEST_F(StatusBarOffersTest, ActionThreeIsTheApplications) {
  makeBar(offer);
  log().clear();
  button().sendActions(ControlEvent::TouchUpInside);
  EXPECT_EQ(button().target->performed, 1);
  EXPECT_EQ(heard->presses, 1);
  EXPECT_THAT(log().messages(), ::testing::ElementsAre("INFO ================= Pressed Upgrade Storage",
                                                       "INFO UpgradeStorage button pressed, link.action=3"));
}

TEST_F(StatusBarOffersTest, OtherActionsThatTheLinkCannotDoDoNothing) {
  makeBar(offer);
  for (const int code : {0, 1, 2, 4, -3}) {
    button().target->code = code;
    button().sendActions(ControlEvent::TouchUpInside);
    EXPECT_TRUE(logged("INFO", "UpgradeStorage button pressed, link.action=" + std::to_string(code)));
  }
  EXPECT_EQ(button().target->performed, 5);
  EXPECT_EQ(heard->presses, 0);
}

TEST_F(StatusBarOffersTest, APressWithoutALinkOrADelegateIsOnlyLogged) {
  makeBar(offer);
  bar->showUpgradeOffer(nullptr);
  button().sendActions(ControlEvent::TouchUpInside);
  EXPECT_TRUE(logged("INFO", "UpgradeStorage button pressed, link.action=0"));
  EXPECT_EQ(heard->presses, 0);
  bar->showUpgradeOffer(offer);
  heard = nullptr;
  button().sendActions(ControlEvent::TouchUpInside);
  EXPECT_EQ(bar->delegate(), nullptr);
}

TEST_F(StatusBarOffersTest, AChangedOfferReachesEveryList) {
  loadNav();
  const auto below = topList();
  nav->pushViewController(makeList(addFolder("Plans")), false);
  EXPECT_FALSE(showsButton(*below));
  EXPECT_FALSE(showsButton(*topList()));
  setOffer(2);
  offerChanged();
  EXPECT_TRUE(showsButton(*below));
  EXPECT_TRUE(showsButton(*topList()));
  memory.offers.offer = nullptr;
  offerChanged();
  EXPECT_FALSE(showsButton(*below));
  EXPECT_FALSE(showsButton(*topList()));
}

TEST_F(StatusBarOffersTest, AListThatComesLaterHasTheOffer) {
  setOffer(2);
  loadNav();
  nav->pushViewController(makeList(addFolder("Plans")), false);
  EXPECT_TRUE(showsButton(*topList()));
}

TEST_F(StatusBarOffersTest, PressingTheButtonOfAListBeginsTheUpgradeOverIt) {
  setOffer(2);
  loadNav();
  nav->pushViewController(makeList(addFolder("Plans")), false);
  statusBarOf(*topList())->labelsView()->quotaButton()->sendActions(ControlEvent::TouchUpInside);
  EXPECT_EQ(nav->upgradeFlowMgr()->offer(), nav->upgradeOffer());
  EXPECT_EQ(upgradeFlowPresenter(), nav->topViewController());
}

TEST_F(StatusBarOffersTest, LateFetchesUseTheFetcherOfTheirTime) {
  loadNav();
  becomeActive();
  runAllQueues();
  offerChanged();
  signOut();
  identityChanged();
  const int before = quotaFetches();
  advance(std::chrono::seconds(5));
  EXPECT_EQ(quotaFetches(), before);
  signIn("somebody else");
  identityChanged();
  runAllQueues();
  const int again = quotaFetches();
  advance(std::chrono::seconds(15));
  EXPECT_EQ(quotaFetches(), again + 1);
}

}  // namespace
}  // namespace vaelo
