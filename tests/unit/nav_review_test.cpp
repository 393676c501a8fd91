// SPDX-License-Identifier: GPL-3.0-or-later
#include <gmock/gmock.h>

#include "app/preview_nav_controller.h"
#include "fileops/filename_prompt.h"
#include "platform/ui/search_controller.h"
#include "tests/unit/nav_review_fixture.h"

/// The corners of the stack and the account: orders, animations, who is told to stop, and what stays.
namespace vaelo {
namespace {

using ::testing::ElementsAre;

// The stack.

TEST_F(NavReviewTest, TheViewIsSetUpInItsOrder) {
  loadNav();
  EXPECT_LT(lineOf("Vaelo is enabled"), lineOf("Contained items: ()"));
  EXPECT_LT(lineOf("Contained items: ()"), lineOf("New DLC (0 items): "));
  EXPECT_LT(lineOf("New DLC (0 items): "), lineOf("NavController viewDidLoad"));
  EXPECT_LT(lineOf("NavController viewDidLoad"), lineOf("Quota Offer level is not set"));
  EXPECT_LT(lineOf("Quota Offer level is not set"), log().lines().size());
  EXPECT_EQ(topList()->view()->superview(), nav->view().get());
}

TEST_F(NavReviewTest, WhatEditModeAndTheActionsKeepIsEmptyAtTheStart) {
  loadNav();
  EXPECT_EQ(nav->barButtonNewFolder(), nullptr);
  EXPECT_EQ(nav->barButtonDeleteItem(), nullptr);
  EXPECT_EQ(nav->barButtonMoveItem(), nullptr);
  EXPECT_EQ(nav->documentInteractionController(), nullptr);
  EXPECT_FALSE(nav->performActionCompletionBlock());
  EXPECT_EQ(nav->folderPromptAlert(), nullptr);
  EXPECT_EQ(nav->splitViewController(), nullptr);
  EXPECT_EQ(nav->lastQuotaFetch(), std::nullopt);
  EXPECT_EQ(PreviewNavController().className(), "PreviewNavController");
}

TEST_F(NavReviewTest, AShareSheetMayGoWithoutAnyEffect) {
  loadNav();
  const auto before = nav->viewControllers();
  const auto sheet = platform().screens.makeDocumentInteraction(document);
  sheet->setDelegate(nav);
  static_cast<DocumentInteractionControllerDelegate&>(*nav).documentInteractionControllerDidDismissOptionsMenu(*sheet);
  EXPECT_EQ(nav->viewControllers(), before);
}

TEST_F(NavReviewTest, EachStackHasItsOwnPollerOfTheQuota) {
  loadNav();
  topList()->itemsLoaded({document});
  EXPECT_TRUE(nav->pickerIsAlive());
  const std::weak_ptr<QuotaFetcher> former = nav->quotaFetcher();
  nav->setupInitialViewController();
  EXPECT_FALSE(nav->pickerIsAlive());
  EXPECT_TRUE(former.expired());
  ASSERT_NE(nav->quotaFetcher(), nullptr);
  EXPECT_EQ(nav->quotaFetcher()->delegate().get(), nav.get());
  runAllQueues();
  const int before = quotaFetches();
  advance(std::chrono::seconds(299));
  EXPECT_EQ(quotaFetches(), before);
  advance(std::chrono::seconds(1));
  EXPECT_EQ(quotaFetches(), before + 1);
}

TEST_F(NavReviewTest, AListIsConfiguredBeforeItIsPushedAndAgainWhenItIsShown) {
  loadShownNav();
  const auto folder = makeList(addFolder("Plans"));
  log().clear();
  topList()->userSelectedContainer(folder);
  EXPECT_EQ(countOf("New DLC ("), 2u);
  nav->popViewControllerAnimated(false);
  EXPECT_EQ(countOf("New DLC ("), 3u) << "and each time it is shown";
}

TEST_F(NavReviewTest, OnlyWhatAPersonAskedForIsAnimated) {
  const URL folder = addFolder("Plans");
  loadShownNav();
  topList()->userSelectedContainer(makeList(folder));
  EXPECT_THAT(shown.stacks, ElementsAre(true)) << "a chosen folder";
  topList()->folderWasRemoved();
  EXPECT_THAT(shown.stacks, ElementsAre(true, true)) << "a list whose folder is gone";
  topList()->userSelectedItem(folder);
  EXPECT_THAT(shown.stacks, ElementsAre(true, true, true)) << "a folder that is chosen as an item";
  nav->orbPopToURL(folder);
  EXPECT_THAT(shown.stacks, ElementsAre(true, true, true, true)) << "a firmly pressed folder";
  shown.stacks.clear();
  nav->warpToFolderForURL(addFolder("Other"));
  nav->startSearch("");
  nav->setupInitialViewController();
  EXPECT_THAT(shown.stacks, ElementsAre(false, false, false));
  signOut();
  nav->setupInitialViewController();
  EXPECT_THAT(shown.stacks, ElementsAre(false, false, false, false));
}

TEST_F(NavReviewTest, ThePreviewOfAPressedDocumentIsPushedAnimated) {
  loadShownNav();
  topList()->viewControllerForPreviewing(document);
  nav->orbPopToURL(document);
  EXPECT_EQ(nav->topViewController(), GlimpseItemController::defaultController());
  EXPECT_THAT(shown.stacks, ElementsAre(true));
}

TEST_F(NavReviewTest, WaysInDismissAtOnceAndSearchResultsAnimated) {
  loadShownNav();
  presentSomething();
  nav->warpToNewURLPreviewMode(std::nullopt, 0);
  presentSomething();
  nav->startSearch("x");
  EXPECT_THAT(shown.dismissals, ElementsAre(false, false));
  shown.dismissals.clear();
  topList()->startSearchWithQueryStringBecomeFirstResponder("x", true);
  topList()->userSelectedContainer(makeList(addFolder("Plans")));
  topList()->startSearchWithQueryStringBecomeFirstResponder("x", true);
  nav->orbPopToURL(addFolder("Plans"));
  EXPECT_THAT(shown.dismissals, ElementsAre(true, true));
}

TEST_F(NavReviewTest, ANameIsAskedForOverWhatIsVisibleAnimated) {
  loadShownNav();
  const auto above = std::make_shared<ViewController>();
  nav->presentViewController(above, false);
  shown.changes.clear();
  nav->showRenamePrompt(addFile("a.txt"));
  EXPECT_EQ(shown.changes, std::vector<std::string>{"present, animated"});
  ASSERT_NE(nav->folderPromptAlert(), nullptr);
  EXPECT_EQ(above->presentedViewController(), nav->folderPromptAlert()->alert());
}

TEST_F(NavReviewTest, AListThatHasItsItemsHasItsLineWhenItIsShown) {
  loadShownNav();
  topList()->itemsLoaded({addFile("a.txt")});
  const auto list = makeList(addFolder("Plans"));
  list->itemsLoaded({addFile("Plans/b.txt"), addFile("Plans/c.txt")});
  nav->pushViewController(list, false);
  EXPECT_EQ(statusText(), nav->toolbarStatusText(2));
}

TEST_F(NavReviewTest, OnlyASearchIsDismissedForAChosenFolder) {
  loadNav();
  presentSomething();
  const auto chosen = makeList(addFolder("Plans"));
  topList()->userSelectedContainer(chosen);
  EXPECT_NE(nav->presentedViewController(), nullptr);
  EXPECT_EQ(nav->topViewController(), chosen) << "pushed, not reached through a new stack";
}

TEST_F(NavReviewTest, EditModeKeepsAFolderAmongSearchResultsAway) {
  loadNav();
  topList()->startSearchWithQueryStringBecomeFirstResponder("x", true);
  nav->setEditModeAndUpdateUIForViewController(true, topList());
  topList()->userSelectedContainer(makeList(addFolder("Plans")));
  EXPECT_NE(nav->presentedViewController(), nullptr);
  EXPECT_EQ(nav->viewControllers().size(), 1u);
}

TEST_F(NavReviewTest, ASearchOnTheUnavailableScreenOrOfNobodyDoesNothing) {
  signOut();
  loadNav();
  nav->startSearch("x");
  advance(std::chrono::milliseconds(700));
  EXPECT_EQ(nav->presentedViewController(), nullptr);
  nav->startSearch("x");
  const std::weak_ptr<NavController> weak = nav;
  nav = nullptr;
  EXPECT_TRUE(weak.expired());
  advance(std::chrono::milliseconds(700));
}

TEST_F(NavReviewTest, ScreensThatAreNoListsChangeNothing) {
  loadNav();
  nav->setEditModeAndUpdateUIForViewController(true, topList());
  const auto manager = previewing(document);
  EXPECT_EQ(nav->itemManager(), manager);
  nav->setToolbarHidden(true);
  nav->pushViewController(std::make_shared<ViewController>(), false);
  EXPECT_EQ(nav->itemManager(), manager);
  EXPECT_TRUE(nav->toolbarHidden());
  EXPECT_TRUE(nav->editMode());
}

TEST_F(NavReviewTest, AListThatIsStillBeingEditedKeepsEditMode) {
  loadNav();
  nav->setEditModeAndUpdateUIForViewController(true, topList());
  nav->pushViewController(std::make_shared<ViewController>(), false);
  nav->popViewControllerAnimated(false);
  EXPECT_TRUE(nav->editMode());
}

TEST_F(NavReviewTest, AListBeingEditedDoesNotBeginEditMode) {
  loadNav();
  const auto list = makeList(addFolder("Plans"));
  list->setEditingAnimated(true, false);
  nav->pushViewController(list, false);
  EXPECT_FALSE(nav->editMode());
}

// Choosing, peeking, popping.

TEST_F(NavReviewTest, AVanishedItemIsToldEvenInEditMode) {
  loadNav();
  const auto before = topList();
  nav->setEditModeAndUpdateUIForViewController(true, before);
  before->userSelectedItem(addFolder("Plans").appendingPathComponent("gone.txt"));
  ASSERT_NE(presentedAlert(), nullptr);
  EXPECT_EQ(presentedAlert()->title(), "The file couldn’t be opened because there is no such file.");
  EXPECT_FALSE(logged("DEBUG", "DLC Selection not allowed while in edit mode"));
  runMainQueue();
  EXPECT_NE(nav->topViewController(), before);
}

TEST_F(NavReviewTest, AChosenItemIsLoggedWithItsSizeAndExtension) {
  loadNav();
  topList()->userSelectedItem(document);
  EXPECT_TRUE(loggedStarting("DEBUG", "DRItem: "));
  EXPECT_LT(lineOf(" bytes txt)"), log().lines().size());
  EXPECT_LT(lineOf("Picked URL: "), lineOf(" bytes txt)"));
}

TEST_F(NavReviewTest, AFolderChosenAsAnItemReplacesTheStack) {
  const URL folder = addFolder("Plans/2026");
  loadNav();
  topList()->userSelectedContainer(makeList(addFolder("Other")));
  topList()->userSelectedItem(folder);
  EXPECT_EQ(nav->viewControllers().size(), 3u);
  EXPECT_EQ(*topList()->presentedURL(), folder);
  EXPECT_TRUE(logged("DEBUG", "Building DLC stack for symlink to " + folder.absoluteString()));
}

TEST_F(NavReviewTest, ALinkInACircleIsIgnored) {
  const URL link = addFolder("Plans").appendingPathComponent("circle");
  addLink("Plans/circle", link);
  loadNav();
  topList()->userSelectedItem(link);
  runMainQueue();
  EXPECT_EQ(nav->viewControllers().size(), 1u);
  EXPECT_EQ(nav->itemManager(), nullptr);
  EXPECT_TRUE(logged("DEBUG", "DLC Selection is symlink that didn't resolve to valid target: " + link.absoluteString()));
}

TEST_F(NavReviewTest, WhatReplacesAPreviewEndsItsFollowing) {
  loadNav();
  const auto expectEnded = [&](const std::shared_ptr<PreviewItemManager>& former) {
    EXPECT_NE(nav->itemManager(), former);
    EXPECT_FALSE(files.isFollowedBy(former));
  };
  auto former = previewing(document);
  EXPECT_TRUE(files.isFollowedBy(former));
  nav->showPreviewPreviewMode(DRItem::initWithURL(other), 1);
  expectEnded(former);
  EXPECT_EQ(previewed(), other);
  EXPECT_EQ(nav->itemManager()->mode(), 1);

  former = nav->itemManager();
  previewing(document);
  expectEnded(former);

  former = nav->itemManager();
  nav->decodeRestorableStateWithCoder(DictionaryRestorationCoder({{"url", other}}));
  expectEnded(former);
  EXPECT_EQ(nav->itemManager()->mode(), 0) << "no mode was kept";

  former = nav->itemManager();
  EXPECT_FALSE(nav->warpToNewURLPreviewMode(document.appendingPathComponent("no").appendingPathComponent("such"), 1));
  expectEnded(former);
  EXPECT_EQ(nav->itemManager()->mode(), 1) << "a warp that fails has made its manager";

  former = previewing(document);
  nav->popToRootViewControllerAnimated(false);
  expectEnded(former);
  EXPECT_EQ(nav->itemManager(), nullptr);
}

TEST_F(NavReviewTest, APeekDoesNotEndTheFollowingOfTheFormerPreview) {
  loadNav();
  const auto root = std::static_pointer_cast<DocumentListController>(nav->viewControllers().front());
  const auto former = previewing(document);
  root->viewControllerForPreviewing(other);
  EXPECT_NE(nav->itemManager(), former);
  EXPECT_TRUE(files.isFollowedBy(former));
  EXPECT_TRUE(files.isFollowedBy(nav->itemManager()));
  EXPECT_EQ(nav->itemManager()->mode(), 0);
}

TEST_F(NavReviewTest, APeekAtAFolderLeavesThePreviewAlone) {
  loadNav();
  const auto root = topList();
  const auto former = previewing(document);
  root->viewControllerForPreviewing(addFolder("Plans"));
  EXPECT_EQ(nav->itemManager(), former);
}

TEST_F(NavReviewTest, APeekAtALinkShowsNothing) {
  const URL link = addLink("shortcut", document);
  loadNav();
  EXPECT_EQ(topList()->viewControllerForPreviewing(link), nullptr);
  EXPECT_TRUE(logged("DEBUG", "URL is not a regular file, package, or folder"));
}

TEST_F(NavReviewTest, APressedFolderWithoutAStackIsLogged) {
  const URL folder = addFolder("Plans");
  loadNav();
  makeNoHierarchies();
  const auto before = nav->viewControllers();
  nav->orbPopToURL(folder);
  EXPECT_EQ(nav->viewControllers(), before);
  EXPECT_TRUE(logged("ERROR", "Couldn't build DLC stack for " + folder.absoluteString() + ". Not switching to folder"));
}

TEST_F(NavReviewTest, APressedSearchResultIsPreviewedWhereWeAreWhenThereIsNoWayDownToIt) {
  loadNav();
  topList()->startSearchWithQueryStringBecomeFirstResponder("a", true);
  topList()->viewControllerForPreviewing(document);
  makeNoHierarchies();
  nav->orbPopToURL(document);
  EXPECT_EQ(nav->viewControllers().size(), 2u);
  EXPECT_EQ(nav->topViewController(), GlimpseItemController::defaultController());
}

TEST_F(NavReviewTest, APressedSearchResultOfAnotherApplicationLeavesTheStack) {
  giveOwningApplication(document);
  loadNav();
  const auto before = nav->viewControllers();
  topList()->startSearchWithQueryStringBecomeFirstResponder("a", true);
  topList()->viewControllerForPreviewing(document);
  nav->orbPopToURL(document);
  EXPECT_EQ(nav->presentedViewController(), nullptr);
  EXPECT_EQ(nav->viewControllers(), before);
}

TEST_F(NavReviewTest, PressingAnItemThatIsGoneOpensNothing) {
  loadNav();
  nav->orbPopToURL(addFolder("Plans").appendingPathComponent("gone.txt"));
  EXPECT_EQ(nav->viewControllers().size(), 1u);
  EXPECT_TRUE(logged("DEBUG", "openInDefaultApp returned NO, showing cached Glimpse from Orb"));
}

TEST_F(NavReviewTest, TheInfoOfAnItemIsItsDetailsScreen) {
  loadNav();
  bool completed = false;
  topList()->userChoseAction(ItemAction::Info, document, nullptr, [&] {
    completed = true;
    EXPECT_EQ(previewed(), document) << "shown before the row is free";
  });
  EXPECT_TRUE(completed);
  EXPECT_EQ(nav->itemManager()->mode(), 1);
  EXPECT_THAT(userActions(), ElementsAre("DLC Action Info"));
  EXPECT_TRUE(logged("INFO", "================= DLC Action Info"));
  EXPECT_TRUE(logged("INFO", "Info action: " + document.absoluteString()));
  EXPECT_TRUE(loggedStarting("INFO", "Info action item: "));
}

TEST_F(NavReviewTest, TheFormerMoreActionIsAnErrorThatNeverCompletes) {
  loadNav();
  topList()->userChoseAction(ItemAction::More, document, nullptr, [] { ADD_FAILURE() << "never called"; });
  EXPECT_THAT(userActions(), ElementsAre("DLC Action More"));
  EXPECT_TRUE(logged("ERROR", "performAction:1 -- More is deprecated, unexpected value"));
}

// Warps.

TEST_F(NavReviewTest, AWarpToAPromiseGoesToTheItemItStandsFor) {
  const URL logical = addPromise("Plans/c.txt");
  const URL promise = cloud.physicalURL(logical);
  loadNav();
  EXPECT_TRUE(nav->warpToNewURLPreviewMode(promise, 0));
  EXPECT_EQ(previewed(), logical);
}

TEST_F(NavReviewTest, ARefusedWarpLeavesThePreview) {
  const URL trashed = addTrashedFile("a.txt");
  loadNav();
  const auto manager = previewing(document);
  EXPECT_FALSE(nav->warpToNewURLPreviewMode(trashed, 1));
  EXPECT_FALSE(nav->warpToNewURLPreviewMode(addOutsideFile("/elsewhere/a.txt"), 1));
  EXPECT_FALSE(nav->warpToNewURLPreviewMode(std::nullopt, 1));
  EXPECT_EQ(nav->itemManager(), manager);
  EXPECT_TRUE(files.isFollowedBy(manager));
}

// The account and its offer.

TEST_F(NavReviewTest, AnUnreadableSavedTokenAndNoAccountAreTheSame) {
  constexpr const char* key = "com.marrow.VaeloDriveApp.UbiquityIdentityToken";
  preferences().setDataForKey(key, Data{1, 2, 3});
  signOut();
  loadNav();
  becomeActive();
  EXPECT_TRUE(logged("DEBUG", "Vaelo Token Matches"));
  EXPECT_TRUE(preferences().dataForKey(key).has_value());
}

TEST_F(NavReviewTest, SigningOutWhileInTheBackgroundIsSeenOnReturn) {
  loadNav();
  becomeActive();
  resignActive();
  signOut();
  becomeActive();
  EXPECT_EQ(nav->getTopDocumentListController(), nullptr);
  EXPECT_EQ(savedToken(), std::nullopt);
  EXPECT_LT(lineOf("Got DidBecomeActiveNotification (nav)"), lineOf("Vaelo Token Changed, enabled=YES"));
  signIn("somebody else");
  becomeActive();
  EXPECT_NE(nav->getTopDocumentListController(), nullptr);
  EXPECT_FALSE(nav->toolbarHidden());
}

TEST_F(NavReviewTest, TheFetchesAfterAnOfferAskWhoeverPollsByThen) {
  loadNav();
  becomeActive();
  runAllQueues();
  const std::weak_ptr<QuotaFetcher> former = nav->quotaFetcher();
  offerChanged();
  signOut();
  identityChanged();
  int before = quotaFetches();
  advance(std::chrono::seconds(1));
  EXPECT_EQ(quotaFetches(), before) << "nobody does";
  signIn("somebody else");
  identityChanged();
  runAllQueues();
  before = quotaFetches();
  EXPECT_TRUE(former.expired()) << "nothing keeps the poller of the account that went away";
  advance(std::chrono::seconds(4));
  EXPECT_EQ(quotaFetches(), before + 1) << "the new account's";
}

TEST_F(NavReviewTest, TheFetchesAfterAnOfferKeepTheController) {
  loadNav();
  offerChanged();
  const std::weak_ptr<NavController> weak = nav;
  nav = nullptr;
  advance(std::chrono::seconds(19));
  EXPECT_FALSE(weak.expired());
  advance(std::chrono::seconds(1));
  EXPECT_TRUE(weak.expired());
}

TEST_F(NavReviewTest, AChangedOfferRefreshesTheLineAndPassesListsWithoutOne) {
  loadNav();
  topList()->itemsLoaded({document});
  const std::string text = statusText();
  statusBarOf(*topList())->setStatusText("");
  offerChanged();
  EXPECT_EQ(statusText(), text);
  nav->setEditModeAndUpdateUIForViewController(true, topList());
  const auto edited = makeList(addFolder("Plans"));
  edited->setEditingAnimated(true, false);
  nav->pushViewController(edited, false);
  EXPECT_EQ(statusBarOf(*edited), nullptr);
  setOffer(3);
  offerChanged();
  EXPECT_EQ(nav->upgradeOffer()->level(), 3);
}

TEST_F(NavReviewTest, EachPressOfTheButtonMakesAFlowOfTheOffer) {
  loadNav();
  nav->upgradeStorageButtonPressed();
  EXPECT_EQ(nav->upgradeFlowMgr()->offer(), nullptr);
  const auto first = nav->upgradeFlowMgr();
  setOffer(2);
  offerChanged();
  nav->upgradeStorageButtonPressed();
  EXPECT_NE(nav->upgradeFlowMgr(), first);
  EXPECT_EQ(nav->upgradeFlowMgr()->offer(), nav->upgradeOffer());
}

}  // namespace
}  // namespace vaelo
