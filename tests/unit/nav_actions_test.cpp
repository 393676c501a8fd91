// SPDX-License-Identifier: GPL-3.0-or-later
// The actions of one item of a list, and the share sheet.
#include <gmock/gmock.h>

#include "fileops/filename_prompt.h"
#include "preview/preview_details_view_controller.h"
#include "tests/unit/app_fixture.h"

namespace vaelo {
namespace {

using ::testing::ElementsAre;
using ::testing::SizeIs;

class NavActionsTest : public AppFixture {
 protected:
  NavActionsTest() {
    loadNav();
    log().clear();
  }
  void act(int action, const URL& url) {
    nav->documentListControllerPerformActionURLOriginatingViewCompletion(topList(), action, url, row, [this] {
      ++completions;
      if (whenCompleted) whenCompleted();
    });
  }
  std::shared_ptr<MemoryDocumentInteraction> sheet() { return memory.screens.interactions.back(); }
  bool banner(const std::string& label) { return logged("INFO", "================= " + label); }

  const URL file = addFile("a.txt");
  const std::shared_ptr<View> row = std::make_shared<View>(Rect{5, 6, 300, 50});
  int completions = 0;
  std::function<void()> whenCompleted;
};

TEST_F(NavActionsTest, DeleteAsksAtTheRowAndCompletesWithTheAnswer) {
  act(ItemAction::Delete, file);
  EXPECT_TRUE(banner("DLC Action Delete"));
  ASSERT_NE(presentedAlert(), nullptr);
  EXPECT_EQ(presentedAlert()->popoverAnchor()->sourceView.lock(), row);
  EXPECT_EQ(completions, 0);
  ASSERT_TRUE(nav->performActionCompletionBlock());
  presentedAlert()->performAction(presentedAlert()->actions().at(0));
  EXPECT_EQ(completions, 1);
  nav->performActionCompletionBlock()();
  EXPECT_EQ(completions, 2) << "it is the row's that is kept";
  EXPECT_EQ(memory.disk.logicalItem(file.path()), nullptr);
}

TEST_F(NavActionsTest, DeletingOneItemLeavesEditModeAsItIs) {
  nav->setEditModeAndUpdateUIForViewController(true, topList());
  act(ItemAction::Delete, file);
  presentedAlert()->performAction(presentedAlert()->actions().at(0));
  EXPECT_EQ(memory.disk.logicalItem(file.path()), nullptr);
  EXPECT_TRUE(nav->editMode());
}

TEST_F(NavActionsTest, ARefusedDeleteCompletesAtOnce) {
  act(ItemAction::Delete, addFolder("Desktop"));
  EXPECT_EQ(completions, 1);
}

TEST_F(NavActionsTest, MoreIsAnErrorThatCompletesNothing) {
  act(ItemAction::More, file);
  EXPECT_TRUE(banner("DLC Action More"));
  EXPECT_TRUE(logged("ERROR", "performAction:1 -- More is deprecated, unexpected value"));
  EXPECT_EQ(completions, 0);
  EXPECT_EQ(nav->presentedViewController(), nullptr);
}

TEST_F(NavActionsTest, InfoShowsTheDetails) {
  whenCompleted = [this] {
    EXPECT_NE(std::dynamic_pointer_cast<PreviewDetailsViewController>(nav->topViewController()), nullptr);
  };
  act(ItemAction::Info, file);
  EXPECT_TRUE(banner("DLC Action Info"));
  EXPECT_TRUE(logged("INFO", "Info action: " + file.absoluteString()));
  EXPECT_TRUE(loggedStarting("INFO", "Info action item: "));
  EXPECT_NE(std::dynamic_pointer_cast<PreviewDetailsViewController>(nav->topViewController()), nullptr);
  EXPECT_EQ(completions, 1);
}

TEST_F(NavActionsTest, RenameAsksAndCompletesMeanwhile) {
  whenCompleted = [this] { EXPECT_NE(presentedAlert(), nullptr); };
  act(ItemAction::Rename, file);
  EXPECT_TRUE(banner("DLC Action Rename"));
  EXPECT_TRUE(logged("INFO", "Rename action: " + file.absoluteString()));
  EXPECT_EQ(presentedAlert(), nav->folderPromptAlert()->alert());
  EXPECT_EQ(completions, 1);
}

TEST_F(NavActionsTest, MoveOffersFolders) {
  whenCompleted = [this] { EXPECT_NE(nav->presentedViewController(), nullptr); };
  addFolder("Plans");
  act(ItemAction::Move, file);
  EXPECT_TRUE(banner("DLC Action Move"));
  EXPECT_TRUE(logged("INFO", "Move action: " + file.absoluteString()));
  const auto picker = std::dynamic_pointer_cast<DocumentTargetSelectionController>(nav->presentedViewController());
  ASSERT_NE(picker, nullptr);
  EXPECT_THAT(picker->itemsToMove(), ElementsAre(file));
  EXPECT_EQ(completions, 1);
}

TEST_F(NavActionsTest, MoveAsksForANewFolderInTheFolderOfTheList) {
  const auto library = memory.cloud.addContainer("org~example~Notes", "Notes");
  const URL top = *library->documentsFolderURL();
  const URL note = top.appendingPathComponent("a.txt");
  memory.disk.add(note.path());
  memory.cloud.movesAreFree = false;
  nav->pushViewController(makeList(top), false);
  act(ItemAction::Move, note);
  EXPECT_EQ(completions, 1);
  const auto& prompt = nav->folderPromptAlert();
  ASSERT_NE(prompt, nullptr);
  prompt->textField()->userSetText("New");
  EXPECT_TRUE(prompt->alert()->performAction(prompt->defaultAction()));
  EXPECT_NE(memory.disk.logicalItem(top.path() + "/New/a.txt"), nullptr);
}

TEST_F(NavActionsTest, ShareCompletesFirstAndPointsAtTheRow) {
  whenCompleted = [this] {
    EXPECT_TRUE(memory.screens.interactions.empty());
    whenCompleted = nullptr;
  };
  act(ItemAction::Share, file);
  EXPECT_TRUE(banner("DLC Action Share (share sheet)"));
  EXPECT_TRUE(banner("Show Share Sheet (nav)"));
  EXPECT_EQ(log().messages().back(), "INFO showDIC: " + file.absoluteString()) << "after its banner";
  EXPECT_TRUE(logged("INFO", "Activity (share) action: " + file.absoluteString()));
  EXPECT_TRUE(logged("INFO", "showDIC: " + file.absoluteString()));
  EXPECT_EQ(completions, 1);
  EXPECT_EQ(sheet()->fromView, row);
  EXPECT_TRUE(sheet()->wasAnimated);
  EXPECT_EQ(sheet()->fromRect, (Rect{0, 25, 300, 0}));
  EXPECT_EQ(nav->documentInteractionController(), sheet());
  EXPECT_EQ(sheet()->delegate.lock(), nav);
  EXPECT_FALSE(loggedStarting("INFO", "URL resolved to "));
  sheet()->dismissMenu();
  EXPECT_EQ(completions, 1) << "the sheet's end completes nothing";
  ASSERT_TRUE(nav->performActionCompletionBlock());
  nav->performActionCompletionBlock()();
  EXPECT_EQ(completions, 2) << "it is the row's that is kept";
}

// The middle of 50 points that begin at 100 is at 125.
TEST_F(NavActionsTest, TheSheetPointsIntoAScrolledRow) {
  row->setBounds({40, 100, 300, 50});
  nav->showDICUrlCompletion(row, Value(file), {});
  EXPECT_EQ(sheet()->fromRect, (Rect{40, 125, 300, 0}));
}

TEST_F(NavActionsTest, WithoutARowTheSheetBelongsToTheWindow) {
  nav->showDICUrlCompletion(nullptr, Value(file), [] {});
  EXPECT_EQ(sheet()->fromView, nav->view());
  EXPECT_EQ(sheet()->fromRect, Rect());
}

TEST_F(NavActionsTest, OnlyItemsAreShared) {
  nav->showDICUrlCompletion(row, Value("text"), [this] { ++completions; });
  EXPECT_TRUE(logged("WARNING", "showDIC: url is wrong class: String"));
  EXPECT_TRUE(memory.screens.interactions.empty());
  EXPECT_EQ(completions, 0);
  EXPECT_FALSE(nav->performActionCompletionBlock()) << "nothing goes on";
  EXPECT_TRUE(logged("INFO", "showDIC: text"));
}

TEST_F(NavActionsTest, ALibraryIsSharedByItsName) {
  const auto library = memory.cloud.addContainer("org~example~Notes", "My Notes");
  nav->showDICUrlCompletion(row, Value(*library->documentsFolderURL()), {});
  EXPECT_EQ(sheet()->name(), "My Notes");
  nav->showDICUrlCompletion(row, Value(addFile("Letter.txt")), {});
  EXPECT_EQ(sheet()->name(), "Letter.txt");
}

TEST_F(NavActionsTest, ABookmarkIsSharedAsItsDocument) {
  const URL outside = addOutsideFile("/home/user/Far.pdf");
  const URL bookmark = addFile("Far.vaelobookmark");
  memory.disk.items.at(bookmark.path()).bookmarkTarget = outside;
  nav->showDICUrlCompletion(row, Value(bookmark), {});
  EXPECT_EQ(sheet()->url(), outside);
  EXPECT_TRUE(logged("INFO", "URL resolved to " + outside.absoluteString()));
}

TEST_F(NavActionsTest, PopCompletesFirst) {
  whenCompleted = [this] { EXPECT_EQ(topList()->presentedURL(), Drive); };
  act(ItemAction::FirmpressPop, addFolder("Plans"));
  EXPECT_TRUE(banner("DLC Action Firmpress Pop"));
  EXPECT_TRUE(loggedStarting("INFO", "Preview action: "));
  EXPECT_EQ(completions, 1);
  EXPECT_EQ(topList()->presentedURL()->lastPathComponent(), "Plans");
}

TEST_F(NavActionsTest, AnUnknownActionIsAnErrorThatCompletes) {
  act(9, file);
  EXPECT_TRUE(logged("ERROR", "performAction:9 -- unexpected value"));
  EXPECT_EQ(completions, 1);
  nav->documentListControllerPerformActionURLOriginatingViewCompletion(topList(), 9, file, row, {});
  EXPECT_EQ(completions, 1) << "a completion is optional";
}

TEST_F(NavActionsTest, TheShortFormComesFromTheWindow) {
  nav->documentListControllerPerformActionURL(topList(), ItemAction::Share, file);
  EXPECT_EQ(sheet()->fromView, nav->view());
  // Unlike without a row, it is the window's own middle.
  const Rect bounds = nav->view()->bounds();
  EXPECT_GT(bounds.width, 0);
  EXPECT_EQ(sheet()->fromRect, (Rect{0, bounds.height / 2, bounds.width, 0}));
  EXPECT_TRUE(nav->performActionCompletionBlock()) << "one that does nothing";
}

}  // namespace
}  // namespace vaelo
