// SPDX-License-Identifier: GPL-3.0-or-later
// The shared quick preview, and Delete and Move from a preview.
#include "tests/unit/preview_fixture.h"

namespace vaelo {
namespace {

using ::testing::ElementsAre;
using ::testing::IsEmpty;
using ::testing::SizeIs;

class PreviewActionsTest : public PreviewFixture {
 protected:
  std::shared_ptr<AlertController> sheet() { return presentedAlert(); }
  void answer(std::size_t action) {
    const auto asked = sheet();
    asked->performAction(asked->actions().at(action));
  }
  std::shared_ptr<DocumentTargetSelectionController> picker() {
    return std::dynamic_pointer_cast<DocumentTargetSelectionController>(nav->presentedViewController());
  }
  void pressed(const std::string& label) {
    EXPECT_FALSE(userActions().empty());
    EXPECT_THAT(userActions(), ::testing::Contains(label));
    EXPECT_TRUE(logged("INFO", "================= " + label));
  }
  const BarButtonItemRef& trash() { return glimpse()->additionalRightBarButtonItems().at(0); }
  const BarButtonItemRef& organize() { return glimpse()->additionalRightBarButtonItems().at(1); }
};

TEST_F(PreviewActionsTest, TheQuickPreviewIsOneScreenWithTwoButtons) {
  EXPECT_EQ(GlimpseItemController::defaultController(), glimpse());
  EXPECT_EQ(glimpse()->PreviewController::delegate(), glimpse());
  EXPECT_EQ(glimpse()->dataSource(), glimpse());
  ASSERT_THAT(glimpse()->additionalRightBarButtonItems(), SizeIs(2));
  EXPECT_EQ(trash()->systemItem(), SystemItem::Trash);
  EXPECT_EQ(organize()->systemItem(), SystemItem::Organize);
  EXPECT_THAT(glimpse()->previewActionItems(), IsEmpty());
}

TEST_F(PreviewActionsTest, AManagerWithoutAnItemShowsNoDocument) {
  show();
  EXPECT_EQ(glimpse()->itemCount(), 1u);
  EXPECT_EQ(glimpse()->itemAtIndex(0), document);
  const auto manager = makeManager();
  glimpse()->glimpseNewItem(manager);
  EXPECT_EQ(glimpse()->itemCount(), 0u);
  EXPECT_EQ(glimpse()->arrayOfDocuments(), std::nullopt);
}

TEST_F(PreviewActionsTest, EachManagerMakesTheScreenAskForDocumentsAnew) {
  const auto manager = show();
  std::vector<std::size_t> counts;
  const auto token = glimpse()->previewChanged().connect([&counts](PreviewController& controller, PreviewChange change) {
    if (change == PreviewChange::AllItems) counts.push_back(controller.itemCount());
  });
  glimpse()->glimpseNewItem(makeManager());
  glimpse()->glimpseNewItem(manager);
  EXPECT_THAT(counts, ElementsAre(0u, 1u)) << "with the documents already changed";
  EXPECT_EQ(glimpse()->itemManager(), manager);
}

TEST_F(PreviewActionsTest, TheScreenDoesNotKeepItsManager) {
  auto manager = show();
  const std::weak_ptr<PreviewItemManager> weak = manager;
  manager = nullptr;
  EXPECT_TRUE(weak.expired());
  EXPECT_EQ(glimpse()->itemManager(), nullptr);
  organize()->press();
  trash()->press();
  EXPECT_EQ(nav->presentedViewController(), nullptr);
}

TEST_F(PreviewActionsTest, AScreenOfItsOwnTakesTheItemWithoutLoading) {
  const auto manager = show();
  log().clear();
  const auto own = GlimpseItemController::initWithItemManager(manager);
  EXPECT_EQ(own->itemManager(), manager);
  EXPECT_THAT(*own->arrayOfDocuments(), ElementsAre(document));
  EXPECT_FALSE(logged("DEBUG", "GLPreviewController: reloadData"));
  EXPECT_FALSE(own->isVisible());
  EXPECT_FALSE(own->isViewLoaded()) << "asking does not load it";
}

TEST_F(PreviewActionsTest, IsVisibleWhileItIsInAWindow) {
  show();
  EXPECT_TRUE(glimpse()->isVisible());
  nav->popViewControllerAnimated(false);
  EXPECT_FALSE(glimpse()->isVisible());
}

TEST_F(PreviewActionsTest, MarkupIsForNamesOfPortableDocuments) {
  const auto edits = [this](const char* name) { return glimpse()->canEditItem(URL(std::string("/") + name)); };
  EXPECT_TRUE(edits("report.pdf"));
  EXPECT_TRUE(edits("report.PDF"));
  EXPECT_FALSE(edits("report.dat"));
  EXPECT_FALSE(edits("report"));
  EXPECT_FALSE(edits("report.txt"));
  memory.types.typeOfExtension["signed"] = "org.example.signed-document";
  memory.types.conformances["org.example.signed-document"] = {"com.adobe.pdf", "public.data"};
  EXPECT_TRUE(edits("report.signed")) << "a kind of portable document";
  memory.types.makesTypes = false;
  EXPECT_FALSE(edits("report.dat")) << "no type at all";
  EXPECT_TRUE(glimpse()->shouldSaveEditedItem(URL("/report.pdf")));
  EXPECT_FALSE(glimpse()->shouldSaveEditedItem(URL("/report.txt")));
}

TEST_F(PreviewActionsTest, ButtonsActOnTheDocumentOfTheLatestManager) {
  const auto first = show();
  const auto second = makeManager();
  const URL other = addFile("Plans/Other.pdf");
  second->previewItem(DRItem::initWithURL(other));
  organize()->press();
  ASSERT_NE(picker(), nullptr);
  EXPECT_THAT(picker()->itemsToMove(), ElementsAre(other));
  pressed("Pressed Move (GL)");
  EXPECT_TRUE(logged("INFO", "Pressed Move"));
}

TEST_F(PreviewActionsTest, DeleteAsksAtItsButtonAndRemovesTheDocument) {
  const auto manager = show();
  trash()->press();
  pressed("Pressed Delete (GL)");
  ASSERT_NE(sheet(), nullptr);
  EXPECT_EQ(sheet()->popoverAnchor()->barButtonItem, trash());
  EXPECT_EQ(sheet()->popoverAnchor()->sourceView.lock(), nullptr);
  answer(0);
  pressed("Delete was Confirmed (itemMgr)");
  EXPECT_EQ(memory.disk.logicalItem(document.path()), nullptr);
  EXPECT_EQ(top(), glimpse()) << "the preview goes when the deletion is noticed";
  memory.coordination.othersDelete(document);
  runAllQueues();
  EXPECT_NE(top(), glimpse());
}

TEST_F(PreviewActionsTest, DeleteGoesToTheDocumentWhereverItIsByThen) {
  auto manager = show();
  trash()->press();
  const URL moved = addFolder("Archive").appendingPathComponent("Report.pdf");
  memory.disk.move(document.path(), moved.path());
  memory.coordination.othersMoved(document, moved);
  runAllQueues();
  addFile("Plans/Report.pdf");  // another document in its place
  manager = nullptr;            // the question holds it
  answer(0);
  EXPECT_NE(memory.disk.logicalItem(document.path()), nullptr);
  EXPECT_EQ(memory.disk.logicalItem(moved.path()), nullptr);
}

TEST_F(PreviewActionsTest, WithoutADocumentThereIsNothingToDelete) {
  makeManager()->showWarningAndDeleteDocumentBarButton(topList(), trash());
  EXPECT_EQ(sheet(), nullptr);
  pressed("Delete was Cancelled (itemMgr)");
}

TEST_F(PreviewActionsTest, ACancelledDeleteLeavesTheDocument) {
  const auto manager = show();
  trash()->press();
  answer(1);
  pressed("Delete was Cancelled (itemMgr)");
  EXPECT_NE(memory.disk.logicalItem(document.path()), nullptr);
}

TEST_F(PreviewActionsTest, ADeleteThatFailsIsToldAndThePreviewStays) {
  const auto manager = show();
  trash()->press();
  memory.disk.items.at(document.path()).isLocked = true;
  answer(0);
  ASSERT_NE(sheet(), nullptr);
  EXPECT_THAT(sheet()->actions(), SizeIs(1)) << "an alert with OK";
  EXPECT_TRUE(loggedStarting("ERROR", "failed to delete item:"));
  EXPECT_EQ(top(), glimpse());
}

TEST_F(PreviewActionsTest, MoveOffersFoldersOverThePreview) {
  const auto manager = show();
  manager->showMoveTarget(glimpse());
  ASSERT_NE(picker(), nullptr);
  EXPECT_EQ(picker()->modalPresentationStyle(), PresentationStyle::OverCurrentContext);
  EXPECT_EQ(picker()->delegate(), manager);
  EXPECT_FALSE(picker()->allowsCrossContainer()) << "there is no other container";
  EXPECT_TRUE(logged("INFO", "Pressed Move (itemMgr)"));
  EXPECT_TRUE(logged("DEBUG", "Presented moveTarget"));
}

TEST_F(PreviewActionsTest, MoveOffersOtherContainersWhenTheyCanTakeTheDocument) {
  memory.cloud.addContainer("org~example~Sketchbook", "Sketchbook");
  const auto manager = show();
  manager->showMoveTarget(glimpse());
  EXPECT_TRUE(picker()->allowsCrossContainer());
}

TEST_F(PreviewActionsTest, AScreenOutsideTheStackOffersNoFolders) {
  const auto manager = show();
  manager->showMoveTarget(std::make_shared<PreviewBaseViewController>());
  EXPECT_EQ(picker(), nullptr);
  EXPECT_FALSE(logged("DEBUG", "Presented moveTarget"));
}

TEST_F(PreviewActionsTest, WithoutADocumentThereIsNothingToMove) {
  const auto manager = makeManager();
  manager->showMoveTarget(topList());
  EXPECT_EQ(picker(), nullptr);
  EXPECT_TRUE(logged("INFO", "Pressed Move (itemMgr)"));
}

TEST_F(PreviewActionsTest, TheChosenFolderGetsTheDocument) {
  const auto manager = show();
  const URL folder = addFolder("Archive");
  manager->showMoveTarget(glimpse());
  picker()->userSelected(folder);
  EXPECT_EQ(picker(), nullptr);
  EXPECT_NE(memory.disk.logicalItem(folder.appendingPathComponent("Report.pdf").path()), nullptr);
  EXPECT_EQ(memory.disk.logicalItem(document.path()), nullptr);
  EXPECT_TRUE(logged("DEBUG", "MoveTarget = " + text(folder)));
  EXPECT_TRUE(logged("DEBUG", "ItemsToMove = (" + text(document) + ")"));
}

TEST_F(PreviewActionsTest, AMoveOntoAnItemOfThatNameIsTold) {
  const auto manager = show();
  const URL folder = addFolder("Archive");
  addFile("Archive/Report.pdf");
  manager->showMoveTarget(glimpse());
  picker()->userSelected(folder);
  ASSERT_NE(sheet(), nullptr);
  EXPECT_EQ(sheet()->title(), "An item named “Report.pdf” already exists in the new location.");
  EXPECT_NE(memory.disk.logicalItem(document.path()), nullptr);
}

TEST_F(PreviewActionsTest, AFailedMoveDoesNotStopTheOthers) {
  const auto manager = show();
  const URL folder = addFolder("Archive");
  const URL moving = addFolder("Plans/Album.sketchbundle");
  addFile("Archive/Report.pdf");
  const auto several = std::make_shared<DocumentTargetSelectionController>(std::vector<URL>{document, moving}, false);
  manager->documentTargetSelectionControllerDidSelectItemAtURL(several, folder);
  ASSERT_NE(sheet(), nullptr);
  EXPECT_NE(memory.disk.logicalItem(folder.appendingPathComponent("Album.sketchbundle").path()), nullptr);
  EXPECT_TRUE(logged("DEBUG", "Moving dest1: '" + text(folder.appendingPathComponent("Album.sketchbundle", false)) + "'"));
}

TEST_F(PreviewActionsTest, WithoutANavigationControllerAFailedMoveIsNotTold) {
  const URL folder = addFolder("Archive");
  addFile("Archive/Report.pdf");
  const auto orphan = PreviewItemManager::newItemManagerWithModeNavController(0, nullptr);
  const auto picked = std::make_shared<DocumentTargetSelectionController>(std::vector<URL>{document}, false);
  orphan->documentTargetSelectionControllerDidSelectItemAtURL(picked, folder);
  EXPECT_EQ(sheet(), nullptr);
  EXPECT_NE(memory.disk.logicalItem(document.path()), nullptr);
}

}  // namespace
}  // namespace vaelo
