// SPDX-License-Identifier: GPL-3.0-or-later
// How a manager prepares the screen of a document and puts it on the stack.
#include "platform/ui/search_controller.h"
#include "tests/unit/preview_fixture.h"

namespace vaelo {
namespace {

using ::testing::ElementsAre;
using ::testing::SizeIs;
using PreviewManagerTest = PreviewFixture;

TEST_F(PreviewManagerTest, BeginsWithItsQueuesItsModeAndNothingToShow) {
  const auto manager = makeManager(1);
  EXPECT_EQ(manager->mode(), 1);
  EXPECT_EQ(manager->navigationController(), nav);
  EXPECT_EQ(manager->item(), nullptr);
  EXPECT_NE(manager->fcQueue(), nullptr);
  EXPECT_EQ(manager->presentedItemOperationQueue(), manager->fcQueue());
  EXPECT_EQ(manager->downloadQueue()->label(), "downloadQueue");
  EXPECT_FALSE(manager->filePresenterRegistered());
  EXPECT_FALSE(manager->refreshPending());
  EXPECT_FALSE(manager->autoDownload());
  EXPECT_EQ(manager->modifiedDate(), std::nullopt);
  EXPECT_EQ(manager->batonActivity(), nullptr);
  EXPECT_EQ(manager->detailsViewController(), nullptr);
  EXPECT_EQ(manager->currentGlimpseController(), glimpse());
}

TEST_F(PreviewManagerTest, ModeZeroShowsTheSharedQuickPreviewOfTheDocument) {
  setModified(document, std::chrono::seconds(500));
  glimpse()->setTitle("Former.pdf");
  const auto manager = show();
  EXPECT_EQ(top(), glimpse());
  EXPECT_EQ(glimpse()->title(), "Report.pdf");
  EXPECT_EQ(glimpse()->itemManager(), manager);
  EXPECT_THAT(*glimpse()->arrayOfDocuments(), ElementsAre(document));
  EXPECT_EQ(manager->modifiedDate(), Date(std::chrono::seconds(500)));
  EXPECT_TRUE(manager->filePresenterRegistered());
  EXPECT_TRUE(memory.coordination.isFollowedBy(manager));
  EXPECT_TRUE(logged("DEBUG", "Previewing " + text(document)));
  EXPECT_TRUE(logged("DEBUG", "GLPreviewController: reloadData"));
  EXPECT_TRUE(logged("DEBUG", "Preview: Using GlimpseItemController, File Exists"));
}

TEST_F(PreviewManagerTest, AnyOtherModeShowsTheDetails) {
  for (const long mode : {1L, 2L, -1L}) {
    const auto manager = show(mode);
    const auto details = std::dynamic_pointer_cast<PreviewDetailsViewController>(top());
    ASSERT_NE(details, nullptr);
    EXPECT_EQ(manager->detailsViewController(), details);
    EXPECT_EQ(details->mode(), mode);
    EXPECT_EQ(details->itemManager(), manager);
  }
  EXPECT_TRUE(logged("DEBUG", "Preview: Using PreviewDetailsViewController, File Exists"));
}

TEST_F(PreviewManagerTest, ADocumentThatIsNotDownloadedIsPreparedAllTheSame) {
  const auto manager = makeManager();
  manager->previewItem(DRItem::initWithURL(addPromise("Plans/Coming.pdf")));
  EXPECT_EQ(top(), glimpse());
  EXPECT_TRUE(logged("DEBUG", "Preview: Using GlimpseItemController, File doesn't exist"));
}

TEST_F(PreviewManagerTest, NothingToShowLeavesTheStackAlone) {
  const auto manager = makeManager();
  const auto before = nav->viewControllers();
  EXPECT_EQ(manager->prepareToPreviewItem(nullptr), nullptr);
  EXPECT_EQ(times("WARNING", "no preview URL, nothing to show"), 1u);
  const auto item = DRItem::initWithURL(document);
  item->setResolvedURL(std::nullopt);
  manager->previewItem(item);
  EXPECT_EQ(times("WARNING", "no preview URL, nothing to show"), 2u);
  EXPECT_EQ(nav->viewControllers(), before);
  EXPECT_EQ(manager->item(), item);
  EXPECT_FALSE(manager->filePresenterRegistered());
}

TEST_F(PreviewManagerTest, ADocumentThatLostItsPlaceStaysWatchedAsItWas) {
  setModified(document, std::chrono::seconds(500));
  const auto manager = show(1);
  const auto details = manager->detailsViewController();
  setModified(document, std::chrono::seconds(600));
  const auto item = DRItem::initWithURL(document);
  item->setResolvedURL(std::nullopt);
  EXPECT_EQ(manager->prepareToPreviewItem(item), nullptr);
  EXPECT_EQ(manager->item(), item);
  EXPECT_TRUE(manager->filePresenterRegistered());
  EXPECT_EQ(manager->modifiedDate(), Date(std::chrono::seconds(500)));
  EXPECT_EQ(manager->detailsViewController(), details);
  EXPECT_EQ(manager->prepareToPreviewItem(nullptr), nullptr);
  EXPECT_EQ(manager->item(), nullptr);
  EXPECT_FALSE(manager->filePresenterRegistered());
}

TEST_F(PreviewManagerTest, ALinkThatLeadsNowhereIsShownNevertheless) {
  const auto item = DRItem::initWithURL(addLink("Plans/Link", URL("/drive/mirror/com~marrow~Kestrel/gone")));
  ASSERT_NE(item, nullptr);
  ASSERT_TRUE(item->isSymlink());
  item->setResolvedURL(std::nullopt);
  EXPECT_NE(makeManager()->prepareToPreviewItem(item), nullptr);
  EXPECT_EQ(times("WARNING", "no preview URL, nothing to show"), 0u);
}

TEST_F(PreviewManagerTest, SettingTheItemPreparesAgainUnlessToldNotTo) {
  const auto manager = show();
  const auto other = DRItem::initWithURL(addFile("Plans/Other.pdf"));
  manager->setItemUpdatePreview(other, false);
  EXPECT_EQ(manager->item(), other);
  EXPECT_THAT(*glimpse()->arrayOfDocuments(), ElementsAre(document)) << "only stored";
  manager->setItem(other);
  EXPECT_THAT(*glimpse()->arrayOfDocuments(), ElementsAre(*other->url()));
  manager->setItem(nullptr);
  EXPECT_EQ(manager->item(), nullptr);
  EXPECT_TRUE(logged("DEBUG", "Previewing (null)"));
}

TEST_F(PreviewManagerTest, AnotherDocumentIsFollowedInThePlaceOfTheFormerOne) {
  const auto manager = show();
  runAllQueues();
  const auto former = activities().back();
  ASSERT_TRUE(former->isCurrent());
  manager->previewItem(DRItem::initWithURL(document));
  EXPECT_TRUE(former->isCurrent()) << "the same document stays watched";
  manager->previewItem(DRItem::initWithURL(addFile("Plans/Other.pdf")));
  EXPECT_FALSE(former->isCurrent());
  EXPECT_EQ(manager->batonActivity(), nullptr) << "until the bookmark is there";
  EXPECT_TRUE(manager->filePresenterRegistered());
  EXPECT_THAT(memory.coordination.presenters(), ElementsAre(manager.get()));
}

TEST_F(PreviewManagerTest, APreviewTakesThePlaceOfThePreviewOnTop) {
  const auto first = show(1);
  ASSERT_THAT(nav->viewControllers(), SizeIs(2));
  const auto second = show(0);
  EXPECT_THAT(nav->viewControllers(), SizeIs(2));
  EXPECT_EQ(top(), glimpse());
  const auto third = show(1);
  EXPECT_THAT(nav->viewControllers(), SizeIs(2));
  EXPECT_EQ(top(), third->detailsViewController());
}

TEST_F(PreviewManagerTest, TellsPreviewScreensFromOthers) {
  const auto manager = makeManager();
  EXPECT_FALSE(manager->isPreviewControllerDisplayed(nullptr));
  EXPECT_FALSE(manager->isPreviewControllerDisplayed(topList()));
  EXPECT_TRUE(manager->isPreviewControllerDisplayed(glimpse()));
  EXPECT_TRUE(manager->isPreviewControllerDisplayed(std::make_shared<PreviewBaseViewController>()));
  EXPECT_TRUE(manager->isPreviewControllerDisplayed(std::make_shared<PreviewDetailsViewController>()));
}

TEST_F(PreviewManagerTest, ASearchGoesBeforeThePreviewComes) {
  topList()->startSearchWithQueryStringBecomeFirstResponder("rep", true);
  ASSERT_NE(std::dynamic_pointer_cast<SearchController>(nav->presentedViewController()), nullptr);
  show();
  EXPECT_EQ(nav->presentedViewController(), nullptr);
  EXPECT_EQ(top(), glimpse());
}

TEST_F(PreviewManagerTest, WithoutANavigationControllerNothingIsPlaced) {
  const auto manager = show();
  const auto screen = std::make_shared<PreviewBaseViewController>();
  const auto orphan = PreviewItemManager::newItemManagerWithModeNavController(0, nullptr);
  orphan->replaceLastViewController(screen);
  EXPECT_EQ(screen->navigationController(), nullptr);
  EXPECT_EQ(top(), glimpse());
}

TEST_F(PreviewManagerTest, ForgetsTheDetailsThatDisappear) {
  const auto manager = show(1);
  const auto details = manager->detailsViewController();
  manager->viewControllerWillDisappear(glimpse());
  EXPECT_EQ(manager->detailsViewController(), details);
  manager->viewControllerWillDisappear(details);
  EXPECT_EQ(manager->detailsViewController(), nullptr);
}

TEST_F(PreviewManagerTest, EachPreparationMakesNewDetails) {
  const auto manager = show(1);
  const auto former = manager->detailsViewController();
  manager->previewItem(DRItem::initWithURL(document));
  EXPECT_NE(manager->detailsViewController(), former);
  EXPECT_EQ(top(), manager->detailsViewController());
}

TEST_F(PreviewManagerTest, KeepsTheShareSheetOfItsPreview) {
  const auto manager = makeManager();
  const auto sheet = memory.screens.makeDocumentInteraction(document);
  manager->setDocumentInteractionController(sheet);
  EXPECT_EQ(manager->documentInteractionController(), sheet);
  manager->setAutoDownload(true);
  EXPECT_TRUE(manager->autoDownload());
}

TEST_F(PreviewManagerTest, AWarpBuildsTheListsDownToTheDocumentWithItsPreviewOnTop) {
  const auto manager = show();
  const URL other = addFile("Plans/2026/Budget.pdf");
  presentSomething();
  EXPECT_TRUE(manager->warpToNewURL(other));
  EXPECT_EQ(nav->presentedViewController(), nullptr);
  EXPECT_EQ(top(), glimpse());
  EXPECT_EQ(manager->item()->url(), other);
  EXPECT_TRUE(manager->filePresenterRegistered());
  EXPECT_EQ(times("DEBUG", "Preview: Using GlimpseItemController, File Exists"), 2u) << "not prepared twice";
  EXPECT_TRUE(logged("DEBUG", "Previewing " + text(other)));
  const auto above =
      std::dynamic_pointer_cast<DocumentListController>(nav->viewControllers().at(nav->viewControllers().size() - 2));
  ASSERT_NE(above, nullptr);
  EXPECT_EQ(above->presentedURL()->path(), other.deletingLastPathComponent().path());
  EXPECT_TRUE(
      logged("DEBUG", "New VC stack of DLCs: (DocumentListController, DocumentListController, DocumentListController)"));
}

TEST_F(PreviewManagerTest, AWarpToAFolderEndsInItsList) {
  const auto manager = show();
  const URL folder = addFolder("Plans/2026");
  EXPECT_TRUE(manager->warpToNewURL(folder));
  ASSERT_NE(topList(), nullptr);
  EXPECT_EQ(topList()->presentedURL()->path(), folder.path());
  EXPECT_EQ(manager->item()->url(), folder);
  EXPECT_FALSE(manager->filePresenterRegistered());
}

TEST_F(PreviewManagerTest, AWarpThatCannotBeMadeChangesNothing) {
  const auto manager = show();
  const auto before = nav->viewControllers();
  EXPECT_FALSE(manager->warpToNewURL(URL("/drive/mirror/com~marrow~Kestrel/Plans/gone/x.pdf")));
  EXPECT_EQ(nav->viewControllers(), before);
  EXPECT_TRUE(manager->filePresenterRegistered());
  EXPECT_EQ(manager->item()->url(), document);
}

TEST_F(PreviewManagerTest, TheListsOfADocumentAreThoseOfItsFolder) {
  const auto lists = PreviewItemManager::dlcStackForURL(document);
  ASSERT_TRUE(lists);
  EXPECT_EQ(lists->back()->presentedURL()->path(), document.deletingLastPathComponent().path());
  EXPECT_TRUE(lists->front()->showsAllContainers());
  const URL gone("/drive/mirror/com~marrow~Kestrel/gone");
  EXPECT_FALSE(PreviewItemManager::dlcStackForURL(gone));
  EXPECT_TRUE(logged("ERROR", "Can't build DLC stack, can't get directory: " + text(gone)));
  makeNoHierarchies();
  EXPECT_FALSE(PreviewItemManager::dlcStackForURL(document));
  EXPECT_TRUE(logged("ERROR", ": Couldn't build DLC stack for " + text(document.deletingLastPathComponent()) + "."));
}

TEST_F(PreviewManagerTest, APreparationForgetsDetailsThatWereMadeBefore) {
  const auto manager = makeManager(0);
  manager->createDetailsViewController();
  manager->previewItem(DRItem::initWithURL(document));
  EXPECT_EQ(manager->detailsViewController(), nullptr);
}

TEST_F(PreviewManagerTest, ListsThatCouldBeMadeAreNoError) {
  EXPECT_TRUE(PreviewItemManager::dlcStackForURL(document));
  EXPECT_FALSE(loggedStarting("ERROR", ": Couldn't build DLC stack"));
}

TEST_F(PreviewManagerTest, WithoutAnItemNobodyIsAskedForABookmark) {
  memory.provider.holdsAnswers = true;
  const auto manager = makeManager();
  becomeActive();
  runAllQueues();
  EXPECT_TRUE(manager->filePresenterRegistered());
  EXPECT_TRUE(logged("DEBUG", "Becoming active for (null)"));
  EXPECT_TRUE(memory.provider.held.empty());
}

}  // namespace
}  // namespace vaelo
