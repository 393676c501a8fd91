// SPDX-License-Identifier: GPL-3.0-or-later
#include <gmock/gmock.h>

#include "app/peek_folder_view_controller.h"
#include "app/preview_nav_controller.h"
#include "platform/ui/search_controller.h"
#include "tests/unit/nav_review_fixture.h"

namespace vaelo {
namespace {

using ::testing::ElementsAre;

/// The stack: what each list is told, which item a link stands for, and what is kept for the next start.
class AppReviewStackTest : public NavReviewTest {
 protected:
  Dictionary encoded() {
    DictionaryRestorationCoder coder;
    nav->encodeRestorableStateWithCoder(coder);
    return coder.values();
  }
  void choose(const URL& url) {
    topList()->userSelectedItem(url);
    runMainQueue();
  }
};

// Lists.

TEST_F(AppReviewStackTest, aListIsLoggedWithItsTypeAndItsItemsInTheirOrder) {
  const URL folder = addFolder("Plans");
  loadNav();
  const auto list = makeList(folder);
  list->itemsLoaded(std::vector<URL>{other, document});
  log().clear();
  nav->initNewListController(list);
  EXPECT_TRUE(logged("DEBUG", "New DLC (2 items): \"Plans\", UTI=public.folder, URL=" + folder.absoluteString()));
  EXPECT_LT(lineOf("New DLC (2 items): "), lineOf("    .../b.txt"));
  EXPECT_LT(lineOf("    .../b.txt"), lineOf("    .../a.txt"));
  EXPECT_TRUE(logged("DEBUG", "    .../a.txt"));
  EXPECT_LT(lineOf("    .../a.txt"), log().lines().size());
}

TEST_F(AppReviewStackTest, aListWithoutAFolderIsConfiguredAsWell) {
  loadNav();
  const auto list = std::make_shared<DocumentListController>(std::nullopt);
  nav->initNewListController(list);
  EXPECT_TRUE(logged("DEBUG", "New DLC (0 items): \"\", UTI=(null), URL=(null)"));
  EXPECT_EQ(list->availableActions(), 125u);
  EXPECT_EQ(nav->viewTitle(), "");
}

TEST_F(AppReviewStackTest, theRootIsConfiguredBeforeItIsShown) {
  loadNav();
  EXPECT_EQ(topList()->availableActions(), 125u);
  EXPECT_EQ(topList()->view()->backgroundColor(), Color::white());
  EXPECT_EQ(nav->viewTitle(), "Vaelo Drive");
  EXPECT_EQ(nav->quotaBytes(), 0u);
  EXPECT_FALSE(nav->editMode());
}

TEST_F(AppReviewStackTest, theUnavailableScreenHidesTheToolbarAndForgetsTheQuota) {
  loadNav();
  runAllQueues();
  EXPECT_NE(nav->quotaBytes(), 0u);
  signOut();
  nav->setupInitialViewController();
  EXPECT_TRUE(nav->toolbarHidden());
  EXPECT_EQ(nav->quotaBytes(), 0u);
  EXPECT_EQ(countOf("NavController viewDidLoad"), 2u);
  EXPECT_EQ(countOf("ERROR: topViewController is nil"), 0u);
}

TEST_F(AppReviewStackTest, theMissingUnavailableScreenIsToldOverUs) {
  signOut();
  makeNoUnavailableScreen();
  loadNav();
  runMainQueue();
  ASSERT_NE(presentedAlert(), nullptr);
  EXPECT_EQ(presentedAlert()->presentingViewController(), nav.get());
}

TEST_F(AppReviewStackTest, aScreenThatIsNoListIsNoTopListAndNoError) {
  loadNav();
  nav->pushViewController(std::make_shared<ViewController>(), false);
  EXPECT_EQ(nav->getTopDocumentListController(), nullptr);
  EXPECT_EQ(countOf("ERROR: topViewController is nil"), 0u);
}

TEST_F(AppReviewStackTest, theRootStaysWhenItsFolderIsGone) {
  loadNav();
  topList()->folderWasRemoved();
  EXPECT_EQ(nav->viewControllers().size(), 1u);
}

TEST_F(AppReviewStackTest, aFolderThatVanishedBelowTheTopPopsTheTop) {
  loadNav();
  const auto folder = makeList(addFolder("Plans"));
  topList()->userSelectedContainer(folder);
  topList()->userSelectedContainer(makeList(addFolder("Plans/2026")));
  folder->folderWasRemoved();
  EXPECT_EQ(nav->topViewController(), folder);
}

TEST_F(AppReviewStackTest, aWarpToAFolderReplacesTheStackOrLeavesIt) {
  const URL folder = addFolder("Plans");
  loadNav();
  topList()->userSelectedContainer(makeList(addFolder("Other")));
  EXPECT_TRUE(nav->warpToFolderForURL(document)) << "a document stands for its folder";
  EXPECT_EQ(*topList()->presentedURL(), folder);
  EXPECT_EQ(nav->viewControllers().size(), 2u);
  const auto before = nav->viewControllers();
  makeNoHierarchies();
  EXPECT_FALSE(nav->warpToFolderForURL(folder));
  EXPECT_EQ(nav->viewControllers(), before);
}

TEST_F(AppReviewStackTest, theListOfAPeekNeitherSearchesNorOffersAnything) {
  const auto peek = std::make_shared<PeekFolderViewController>(addFolder("Plans"));
  EXPECT_EQ(peek->className(), "PeekFolderViewController");
  EXPECT_FALSE(peek->shouldShowSearch());
  EXPECT_TRUE(makeList(addFolder("Plans"))->shouldShowSearch());
  const AlertActionRef action = AlertAction::make("Open", AlertActionStyle::Default);
  peek->setPreviewActionItems({action});
  EXPECT_THAT(peek->previewActionItems(), ElementsAre(action));
}

// Choosing.

TEST_F(AppReviewStackTest, aLinkToADocumentStandsForTheDocument) {
  makeUnpreviewable(document);
  const URL link = addLink("shortcut", document);
  loadNav();
  choose(link);
  EXPECT_EQ(previewed(), document);
  EXPECT_EQ(nav->itemManager()->mode(), 1) << "the document can't be previewed, the link could";
}

TEST_F(AppReviewStackTest, theApplicationOfALinksDocumentOpensIt) {
  giveOwningApplication(document);
  const URL link = addLink("shortcut", document);
  loadNav();
  choose(link);
  EXPECT_EQ(nav->itemManager(), nullptr);
  EXPECT_EQ(openingPresenter(), topList());
}

TEST_F(AppReviewStackTest, aLinkToAnAliasStandsForTheAlias) {
  const URL second = addFile("onward.desktop");
  memory.disk.items.at(second.path()).aliasTarget = document;
  const URL first = addLink("shortcut", second);
  loadNav();
  choose(first);
  EXPECT_EQ(previewed(), second);
}

TEST_F(AppReviewStackTest, aDocumentIsOpenedOverTheTopScreen) {
  giveOwningApplication(document);
  loadNav();
  topList()->userSelectedContainer(makeList(addFolder("Plans")));
  const auto top = topList();
  choose(document);
  EXPECT_EQ(openingPresenter(), top);
  EXPECT_EQ(nav->topViewController(), top);
}

TEST_F(AppReviewStackTest, aPackageIsADocument) {
  const URL package = addFolder("Drawing.sketchbundle");
  loadNav();
  choose(package);
  EXPECT_EQ(previewed(), package);
  EXPECT_EQ(nav->topViewController(), GlimpseItemController::defaultController());
}

TEST_F(AppReviewStackTest, aVanishedItemIsToldOverTheTopScreen) {
  loadNav();
  const auto top = topList();
  top->userSelectedItem(addFolder("Plans").appendingPathComponent("gone.txt"));
  ASSERT_NE(presentedAlert(), nullptr);
  EXPECT_EQ(presentedAlert()->message(), "");
  EXPECT_TRUE(logged("DEBUG", "DRItem: (null) ((null) bytes txt)"));
  EXPECT_THAT(userActions(), ElementsAre("Selected Item (dlc)"));
}

TEST_F(AppReviewStackTest, choosingSaysSoBeforeAnythingElse) {
  loadNav();
  choose(document);
  EXPECT_LT(lineOf("================= Selected Item (dlc)"), lineOf("Picked URL: "));
  EXPECT_LT(lineOf("Picked URL: "), lineOf("DRItem: "));
  EXPECT_LT(lineOf("DRItem: "), lineOf("openInDefaultApp returned NO, showing preview"));
}

// Peek and pop.

TEST_F(AppReviewStackTest, aPeekSaysWhatItIsAskedFor) {
  loadNav();
  topList()->viewControllerForPreviewing(document);
  EXPECT_THAT(userActions(), ElementsAre("DLC Action Firmpress Peek"));
  EXPECT_TRUE(logged("INFO", "================= DLC Action Firmpress Peek"));
  EXPECT_TRUE(logged("DEBUG", "DLC asking for PeekVC for " + document.absoluteString()));
  EXPECT_EQ(previewed(), document);
}

TEST_F(AppReviewStackTest, onlyASearchIsDismissedForAPress) {
  loadNav();
  topList()->viewControllerForPreviewing(document);
  presentSomething();
  nav->orbPopToURL(document);
  EXPECT_NE(nav->presentedViewController(), nullptr);
  EXPECT_EQ(nav->viewControllers().size(), 2u) << "pushed where we were";
}

TEST_F(AppReviewStackTest, aPressedDocumentIsOpenedOverTheTopScreen) {
  giveOwningApplication(document);
  loadNav();
  const auto top = topList();
  nav->orbPopToURL(document);
  EXPECT_EQ(openingPresenter(), top);
}

TEST_F(AppReviewStackTest, aPressedSearchResultThatIsAFolderIsReachedFromTheRoot) {
  const URL inner = addFolder("Plans/2026");
  loadNav();
  topList()->startSearchWithQueryStringBecomeFirstResponder("2026", true);
  nav->orbPopToURL(inner);
  EXPECT_EQ(nav->presentedViewController(), nullptr);
  EXPECT_EQ(nav->viewControllers().size(), 3u);
  EXPECT_EQ(*topList()->presentedURL(), inner);
}

// State.

TEST_F(AppReviewStackTest, onlyAPreviewThatHasADocumentIsKept) {
  loadNav();
  EXPECT_FALSE(nav->warpToNewURLPreviewMode(document.appendingPathComponent("no").appendingPathComponent("such"), 1));
  ASSERT_NE(nav->itemManager(), nullptr);
  EXPECT_TRUE(encoded().empty());
  previewing(document);
  nav->itemManager()->item()->setUrl(std::nullopt);
  EXPECT_FALSE(encoded().contains("url") || encoded().contains("PreviewMode"));
}

TEST_F(AppReviewStackTest, whatIsKeptIsTheURLAndTheMode) {
  loadNav();
  nav->showPreviewPreviewMode(DRItem::initWithURL(document), 7);
  EXPECT_EQ(encoded(), (Dictionary{{"url", document}, {"PreviewMode", std::int64_t{7}}}));
}

TEST_F(AppReviewStackTest, aPackageIsRestoredAndWhatIsNoURLIsNot) {
  const URL package = addFolder("Drawing.sketchbundle");
  loadNav();
  nav->decodeRestorableStateWithCoder(DictionaryRestorationCoder({{"url", document.path()}}));
  EXPECT_EQ(nav->itemManager(), nullptr);
  nav->decodeRestorableStateWithCoder(DictionaryRestorationCoder({{"url", package}}));
  EXPECT_EQ(previewed(), package);
  EXPECT_EQ(nav->topViewController(), GlimpseItemController::defaultController());
}

TEST_F(AppReviewStackTest, restoringAFolderLeavesThePresentPreview) {
  loadNav();
  const auto manager = previewing(document);
  nav->decodeRestorableStateWithCoder(DictionaryRestorationCoder({{"url", addFolder("Plans")}}));
  EXPECT_EQ(nav->itemManager(), manager);
  EXPECT_TRUE(files.isFollowedBy(manager));
}

}  // namespace
}  // namespace vaelo
