// SPDX-License-Identifier: GPL-3.0-or-later
#include <gmock/gmock.h>

#include <algorithm>

#include "platform/archive.h"
#include "tests/unit/app_fixture.h"

namespace vaelo {
namespace {

using NavAccountsTest = AppFixture;

constexpr const char* TokenKey = "com.marrow.VaeloDriveApp.UbiquityIdentityToken";
constexpr const char* Changed = "Vaelo Token Changed, enabled=%, reinitializing view";

std::string changed(const char* enabled) {
  std::string text = Changed;
  return text.replace(text.find('%'), 1, enabled);
}

TEST_F(NavAccountsTest, TheFirstActivationSavesTheTokenAndBuildsTheStackAgain) {
  loadNav();
  const auto first = nav->topViewController();
  becomeActive();
  EXPECT_NE(nav->topViewController(), first);
  EXPECT_TRUE(logged("INFO", "Got DidBecomeActiveNotification (nav)"));
  EXPECT_TRUE(logged("INFO", changed("YES")));
  ASSERT_TRUE(savedToken().has_value());
  EXPECT_EQ(*savedToken(), *token());
}

TEST_F(NavAccountsTest, TheSameAccountChangesNothing) {
  loadNav();
  becomeActive();
  const auto stack = nav->viewControllers();
  log().clear();
  becomeActive();
  EXPECT_EQ(nav->viewControllers(), stack);
  EXPECT_TRUE(logged("DEBUG", "Vaelo Token Matches"));
  EXPECT_FALSE(logged("INFO", changed("YES")));
}

TEST_F(NavAccountsTest, NoAccountBeforeAndNowChangesNothing) {
  signOut();
  loadNav();
  const auto stack = nav->viewControllers();
  becomeActive();
  EXPECT_EQ(nav->viewControllers(), stack);
  EXPECT_TRUE(logged("DEBUG", "Vaelo Token Matches"));
}

TEST_F(NavAccountsTest, SigningOutShowsTheUnavailableScreenAndStopsPolling) {
  loadNav();
  becomeActive();
  const std::weak_ptr<QuotaFetcher> fetcher = nav->quotaFetcher();
  signOut();
  identityChanged();
  EXPECT_EQ(nav->getTopDocumentListController(), nullptr);
  EXPECT_TRUE(nav->toolbarHidden());
  EXPECT_TRUE(fetcher.expired());
  EXPECT_FALSE(savedToken().has_value());
  const std::vector<std::string> lines = log().messages();
  const auto told = std::find(lines.begin(), lines.end(), "INFO Vaelo account availability changed");
  EXPECT_NE(std::find(told, lines.end(), "INFO " + changed("NO")), lines.end()) << "after that";
}

TEST_F(NavAccountsTest, AnotherAccountIsSavedAndShown) {
  loadNav();
  becomeActive();
  const auto first = nav->topViewController();
  signIn("somebody else");
  identityChanged();
  EXPECT_NE(nav->topViewController(), first);
  EXPECT_EQ(savedToken()->opaque, "somebody else");
}

TEST_F(NavAccountsTest, AnUnreadableSavedTokenCountsAsNone) {
  preferences().setDataForKey(TokenKey, Data{1, 2, 3});
  loadNav();
  becomeActive();
  EXPECT_TRUE(logged("INFO", changed("YES")));
}

TEST_F(NavAccountsTest, TheOfferIsTakenAtOnceUnlessOneIsBeingFetched) {
  setOffer(4);
  loadNav();
  EXPECT_EQ(nav->upgradeOffer()->level(), 4);
  EXPECT_TRUE(logged("INFO", "Quota Offer level is 4"));
}

TEST_F(NavAccountsTest, TheOfferWaitsForAFetch) {
  setOffer(4);
  fetchOfferOnRequest();
  loadNav();
  EXPECT_EQ(nav->upgradeOffer(), nullptr);
  EXPECT_TRUE(logged("INFO", "Quota Offer level is not set"));
}

TEST_F(NavAccountsTest, AChangedOfferReachesEveryListAndFetchesTheQuotaThrice) {
  loadNav();
  nav->pushViewController(makeList(addFolder("Plans")), false);
  runAllQueues();
  const int before = quotaFetches();
  setOffer(2);
  offerChanged();
  EXPECT_TRUE(logged("INFO", "Quota Offer Changed, offer level is 2"));
  for (const ViewControllerRef& screen : nav->viewControllers()) {
    const auto list = std::dynamic_pointer_cast<DocumentListController>(screen);
    EXPECT_EQ(statusBarOf(*list)->labelsView()->quotaButton()->offer(), nav->upgradeOffer());
  }
  runAllQueues();
  EXPECT_EQ(quotaFetches(), before);
  advance(std::chrono::seconds(1));
  EXPECT_EQ(quotaFetches(), before + 1);
  advance(std::chrono::seconds(4));
  EXPECT_EQ(quotaFetches(), before + 2);
  advance(std::chrono::seconds(15));
  EXPECT_EQ(quotaFetches(), before + 3);
}

TEST_F(NavAccountsTest, AChangedOfferWithoutAnAccountFetchesNothing) {
  signOut();
  loadNav();
  offerChanged();
  EXPECT_TRUE(logged("INFO", "Quota Offer Changed, offer level is not set"));
  advance(std::chrono::seconds(20));
  EXPECT_EQ(quotaFetches(), 0);
}

TEST_F(NavAccountsTest, TheUpgradeFlowBeginsOverTheTopScreen) {
  setOffer(2);
  loadNav();
  nav->upgradeStorageButtonPressed();
  EXPECT_NE(nav->upgradeFlowMgr(), nullptr);
  EXPECT_EQ(upgradeFlowPresenter(), nav->topViewController());
  EXPECT_TRUE(logged("INFO", "UpgradeStorage: presenting view controller"));
}

TEST_F(NavAccountsTest, AVanishedOfferStillMakesTheFlowManager) {
  loadNav();
  nav->upgradeStorageButtonPressed();
  EXPECT_NE(nav->upgradeFlowMgr(), nullptr);
  EXPECT_EQ(upgradeFlowPresenter(), nullptr);
  EXPECT_TRUE(logged("INFO", "UpgradeStorage: No upgrade offer"));
}

// What is made for the account finds its token saved.
TEST_F(NavAccountsTest, TheTokenIsSavedBeforeTheStackIsBuiltAgain) {
  loadNav();
  std::optional<UbiquityIdentityToken> savedWhenBuilding;
  memory.queues.makesOperationQueue = [&](const std::string& name, QualityOfService quality) {
    savedWhenBuilding = savedToken();
    return std::make_shared<MemoryOperationQueue>(memory.clock, name, quality);
  };
  becomeActive();
  EXPECT_EQ(savedWhenBuilding, token());
}

TEST_F(NavAccountsTest, AnUnreadableSavedTokenAndNoAccountAreTheSame) {
  preferences().setDataForKey(TokenKey, Data{1, 2, 3});
  signOut();
  loadNav();
  becomeActive();
  EXPECT_TRUE(logged("DEBUG", "Vaelo Token Matches"));
  EXPECT_FALSE(logged("INFO", changed("NO")));
}

}  // namespace
}  // namespace vaelo
