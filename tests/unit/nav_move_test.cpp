// SPDX-License-Identifier: GPL-3.0-or-later
// New folders, moves, and the rename of an item from a list.
#include <gmock/gmock.h>

#include "fileops/filename_prompt.h"
#include "items/url_additions.h"
#include "tests/unit/app_fixture.h"

namespace vaelo {
namespace {

using ::testing::ElementsAre;
using ::testing::IsEmpty;
using ::testing::SizeIs;

class NavMoveTest : public AppFixture {
 protected:
  NavMoveTest() {
    memory.formatting.translations[".DICT.MOVE_ITEMS.%d"] = "move: %@";
    memory.formatting.translations[".DICT.CANNOT_MOVE_ITEMS.%d"] = "not moved: %@";
    loadNav();
    log().clear();
  }
  std::shared_ptr<DocumentTargetSelectionController> picker() {
    return std::dynamic_pointer_cast<DocumentTargetSelectionController>(nav->presentedViewController());
  }
  bool isThere(const URL& url) { return memory.disk.logicalItem(url.path()) != nullptr; }
  const std::shared_ptr<FilenamePrompt>& prompt() { return nav->folderPromptAlert(); }
  void type(const std::string& name) { prompt()->textField()->userSetText(name); }
  bool pressDone() { return prompt()->alert()->performAction(prompt()->defaultAction()); }
  std::string errorLine() { return prompt()->errMsgViewController()->messageLabel()->text(); }
};

TEST_F(NavMoveTest, NewFolderAsksForANameAndMakesIt) {
  const URL folder = *topList()->presentedURL();
  nav->promtForNewFolderAndCreate();
  EXPECT_TRUE(logged("INFO", "================= Pressed NewFolder"));
  EXPECT_TRUE(logged("INFO", "Pressed NewFolder"));
  EXPECT_TRUE(logged("INFO", "================= Show New Folder Prompt (nav, during move)"));
  ASSERT_EQ(presentedAlert(), prompt()->alert());
  EXPECT_EQ(prompt()->alert()->title(), "New Folder");
  EXPECT_EQ(prompt()->alert()->message(), "Enter a name for this folder.");
  EXPECT_EQ(prompt()->textField()->placeholder(), "Folder Name");
  EXPECT_EQ(prompt()->defaultAction()->title(), "Create");
  type(" Plans ");
  EXPECT_TRUE(pressDone());
  EXPECT_EQ(presentedAlert(), nullptr);
  EXPECT_TRUE(logged("INFO", "================= New Folder name entry Confirmed"));
  EXPECT_TRUE(logged("INFO", "New folder entered: Plans"));
  EXPECT_TRUE(memory.disk.hasFolder(folder.appendingPathComponent("Plans").path()));
}

TEST_F(NavMoveTest, AnExistingNameKeepsThePromptOpen) {
  const URL there = addFile("Plans");
  nav->promtForNewFolderAndCreate();
  type("Plans");
  EXPECT_FALSE(pressDone());
  EXPECT_EQ(presentedAlert(), prompt()->alert());
  EXPECT_EQ(errorLine(), "Name is already taken");
  EXPECT_TRUE(logged("INFO", "Item exists at path: " + there.absoluteString() + "/"));
  EXPECT_FALSE(memory.disk.hasFolder(there.path()));
}

TEST_F(NavMoveTest, AFolderThatCannotBeMadeSaysWhy) {
  const URL folder = addFolder("Locked");
  memory.disk.items.at(folder.path()).isLocked = true;
  nav->showNewFolderPromptDuringMoveItemsToMove(folder, {});
  type("Plans");
  EXPECT_FALSE(pressDone());
  EXPECT_EQ(errorLine(), "It can't be used");
  EXPECT_EQ(presentedAlert(), prompt()->alert());
}

TEST_F(NavMoveTest, WithoutAListNothingIsAskedFor) {
  nav->setViewControllers({std::make_shared<ViewController>()}, false);
  nav->promtForNewFolderAndCreate();
  nav->showMoveTargetForSelectedItems();
  EXPECT_EQ(nav->presentedViewController(), nullptr);
  EXPECT_TRUE(logged("INFO", "Pressed NewFolder"));
  EXPECT_TRUE(logged("INFO", "Pressed Move"));
  EXPECT_FALSE(logged("INFO", "================= Show New Folder Prompt (nav, during move)"));
  EXPECT_FALSE(loggedStarting("INFO", "Prompting for Move Target"));
}

TEST_F(NavMoveTest, WithoutAFolderThereIsNoPrompt) {
  nav->showNewFolderPromptDuringMoveItemsToMove(std::nullopt, {});
  EXPECT_TRUE(logged("WARNING", "dlc.presentedURL is nil"));
  EXPECT_EQ(presentedAlert(), nullptr);
}

TEST_F(NavMoveTest, MoveLeavesEditModeAndOffersFolders) {
  const URL file = addFile("a.txt");
  addFolder("Plans");
  topList()->itemsLoaded({file});
  nav->setEditModeAndUpdateUIForViewController(true, topList());
  topList()->setSelectedItems({file});
  nav->showMoveTargetForSelectedItems();
  EXPECT_FALSE(nav->editMode());
  EXPECT_TRUE(logged("INFO", "================= Pressed Move"));
  EXPECT_TRUE(logged("INFO", "Pressed Move"));
  EXPECT_TRUE(logged("INFO", "Prompting for Move Target, 1 items"));
  ASSERT_NE(picker(), nullptr);
  EXPECT_THAT(picker()->itemsToMove(), ElementsAre(file));
  EXPECT_EQ(picker()->delegate(), nav);
  EXPECT_FALSE(picker()->allowsCrossContainer()) << "there is no other library";
  EXPECT_EQ(picker()->modalPresentationStyle(), PresentationStyle::OverCurrentContext);
  EXPECT_TRUE(logged("DEBUG", "Presented moveTarget"));
}

TEST_F(NavMoveTest, AnEmptyLibraryOffersTheOthers) {
  const auto library = memory.cloud.addContainer("org~example~Notes", "Notes");
  const URL top = *library->documentsFolderURL();
  const URL file = top.appendingPathComponent("a.txt");
  memory.disk.add(file.path());
  ASSERT_TRUE(vlo_canCrossZoneMoveURLs({file}));
  nav->showMoveTargetForItemsInFolder({file}, top);
  EXPECT_EQ(prompt(), nullptr);
  ASSERT_NE(picker(), nullptr);
  EXPECT_TRUE(picker()->allowsCrossContainer());
}

TEST_F(NavMoveTest, ThePickerIsGoneBeforeAnythingMoves) {
  const URL file = addFile("a.txt");
  const URL folder = addFolder("Plans");
  nav->showMoveTargetForItemsInFolder({file}, Drive);
  int accesses = 0;
  memory.coordination.beforeAccessor = [&] {
    ++accesses;
    EXPECT_EQ(nav->presentedViewController(), nullptr);
  };
  picker()->userSelected(folder);
  memory.coordination.beforeAccessor = nullptr;
  EXPECT_EQ(accesses, 1);
  EXPECT_TRUE(isThere(folder.appendingPathComponent("a.txt")));
}

TEST_F(NavMoveTest, AMovedFolderIsNamedWithoutASlash) {
  const URL plans = addFolder("Plans");
  const URL trips = addFolder("Trips");
  EXPECT_THAT(nav->moveItemsToDirectoryToDirectory({trips}, plans), IsEmpty());
  EXPECT_TRUE(logged("DEBUG", "Moving dest1: '" + plans.absoluteString() + "Trips'"));
}

TEST_F(NavMoveTest, ErrorsComeInTheOrderOfTheItems) {
  const URL folder = addFolder("Plans");
  addFile("Plans/b.txt");
  const URL a = addFile("a.txt");
  memory.disk.items.at(a.path()).isLocked = true;
  const std::vector<Error> errors = nav->moveItemsToDirectoryToDirectory({a, addFile("b.txt")}, folder);
  ASSERT_THAT(errors, SizeIs(2));
  EXPECT_EQ(errors[0].code, FileErrorCode::WriteNoPermission);
  EXPECT_EQ(errors[1].code, FileErrorCode::WriteFileExists);
}

TEST_F(NavMoveTest, SpecialFoldersAreNotMoved) {
  const URL documents = addFolder("Documents");
  nav->showMoveTargetForItemsInFolder({addFile("a.txt"), documents}, Drive);
  EXPECT_EQ(picker(), nullptr);
  EXPECT_TRUE(loggedStarting("WARNING", "Not moving items with special folder: ("));
  EXPECT_TRUE(isThere(documents));
  EXPECT_FALSE(loggedStarting("INFO", "Prompting for Move Target"));
  ASSERT_NE(presentedAlert(), nullptr);
}

TEST_F(NavMoveTest, WithNowhereToGoANewFolderIsAskedFor) {
  const auto library = memory.cloud.addContainer("org~example~Notes", "Notes");
  const URL top = *library->documentsFolderURL();
  const URL file = top.appendingPathComponent("a.txt");
  memory.disk.add(file.path());
  memory.cloud.movesAreFree = false;
  ASSERT_FALSE(vlo_canCrossZoneMoveURLs({file}));
  nav->showMoveTargetForItemsInFolder({file}, top);
  EXPECT_EQ(picker(), nullptr);
  ASSERT_NE(prompt(), nullptr);
  EXPECT_EQ(prompt()->alert()->title(), "move: 1");
  EXPECT_EQ(prompt()->defaultAction()->title(), "Move");
  type("New");
  EXPECT_TRUE(pressDone());
  EXPECT_TRUE(isThere(top.appendingPathComponent("New").appendingPathComponent("a.txt")));
  memory.disk.addFolder(top.appendingPathComponent("Other").path());
  nav->showMoveTargetForItemsInFolder({file}, top);
  ASSERT_NE(picker(), nullptr) << "now there is a folder to pick";
  EXPECT_FALSE(picker()->allowsCrossContainer());
}

TEST_F(NavMoveTest, ItemsOfAnUnknownFolderMayHaveSomewhereToGo) {
  memory.cloud.movesAreFree = false;
  nav->showMoveTargetForItemsInFolder({addFile("a.txt")}, std::nullopt);
  EXPECT_EQ(prompt(), nullptr);
  ASSERT_NE(picker(), nullptr);
  EXPECT_FALSE(picker()->allowsCrossContainer());
}

TEST_F(NavMoveTest, AMoveIntoANewFolderThatFailsKeepsThePromptAndTheFolder) {
  const URL file = addFile("a.txt");
  nav->showNewFolderPromptDuringMoveItemsToMove(Drive, {file});
  memory.disk.items.at(file.path()).isLocked = true;
  type("New");
  EXPECT_FALSE(pressDone());
  EXPECT_EQ(errorLine(), "It can't be used");
  EXPECT_TRUE(memory.disk.hasFolder(Drive.appendingPathComponent("New").path()));
  EXPECT_FALSE(pressDone());
  EXPECT_EQ(errorLine(), "Name is already taken");
  memory.disk.items.at(file.path()).isLocked = false;
}

TEST_F(NavMoveTest, SeveralFailuresInANewFolderAreCounted) {
  const URL a = addFile("a.txt");
  const URL b = addFile("b.txt");
  nav->showNewFolderPromptDuringMoveItemsToMove(Drive, {a, b});
  memory.disk.items.at(a.path()).isLocked = memory.disk.items.at(b.path()).isLocked = true;
  type("New");
  EXPECT_FALSE(pressDone());
  EXPECT_EQ(errorLine(), "not moved: 2");
}

TEST_F(NavMoveTest, WithoutTheWindowTheFolderIsMadeAndNothingMoves) {
  const URL file = addFile("a.txt");
  nav->showNewFolderPromptDuringMoveItemsToMove(Drive, {file});
  const std::shared_ptr<FilenamePrompt> kept = prompt();
  nav = nullptr;
  bool accepted = false;
  EXPECT_EQ(kept->validateNewFilenameCallback()("New", accepted), "");
  EXPECT_TRUE(accepted);
  EXPECT_TRUE(isThere(file));
}

TEST_F(NavMoveTest, TheChosenFolderGetsTheItems) {
  const URL a = addFile("a.txt");
  const URL folder = addFolder("Plans");
  nav->showMoveTargetForItemsInFolder({a}, Drive);
  picker()->userSelected(folder);
  EXPECT_EQ(picker(), nullptr);
  EXPECT_TRUE(isThere(folder.appendingPathComponent("a.txt")));
  EXPECT_FALSE(isThere(a));
  EXPECT_TRUE(logged("INFO", "================= Move Target Selected (nav)"));
  EXPECT_TRUE(logged("INFO", "Move Target Selected: " + folder.absoluteString()));
  EXPECT_TRUE(logged("DEBUG", "MoveTarget = " + folder.absoluteString()));
  EXPECT_TRUE(logged("DEBUG", "ItemsToMove = (" + a.absoluteString() + ")"));
  EXPECT_EQ(presentedAlert(), nullptr);
}

TEST_F(NavMoveTest, EveryItemIsTriedAndTheFailuresAreToldOnce) {
  const URL a = addFile("a.txt");
  const URL b = addFile("b.txt");
  const URL c = addFile("c.txt");
  const URL folder = addFolder("Plans");
  addFile("Plans/a.txt");
  addFile("Plans/b.txt");
  nav->moveItemsToDirectoryAndShowErrorsToDirectory({a, b, c}, folder);
  EXPECT_TRUE(isThere(folder.appendingPathComponent("c.txt")));
  EXPECT_TRUE(isThere(a));
  ASSERT_NE(presentedAlert(), nullptr);
  EXPECT_EQ(presentedAlert()->title(), "not moved: 2");
  EXPECT_EQ(presentedAlert()->message(), "");
}

TEST_F(NavMoveTest, OneFailureIsToldInItsOwnWords) {
  const URL a = addFile("a.txt");
  const URL folder = addFolder("Plans");
  addFile("Plans/a.txt");
  nav->moveItemsToDirectoryAndShowErrorsToDirectory({a}, folder);
  EXPECT_EQ(presentedAlert()->title(), "An item named “a.txt” already exists in the new location.");
}

TEST_F(NavMoveTest, RenameAsksWithTheNameAndRenames) {
  const URL file = addFile("Notes.pdf");
  nav->showRenamePrompt(file);
  ASSERT_EQ(presentedAlert(), prompt()->alert());
  EXPECT_EQ(prompt()->alert()->title(), "Rename Item");
  EXPECT_EQ(prompt()->alert()->message(), "Enter a new name for this item.");
  EXPECT_EQ(prompt()->textField()->text(), "Notes.pdf");
  EXPECT_EQ(prompt()->defaultAction()->title(), "Done");
  EXPECT_TRUE(prompt()->defaultAction()->enabled());
  type("Report");
  EXPECT_TRUE(pressDone());
  EXPECT_TRUE(isThere(Drive.appendingPathComponent("Report.pdf")));
  EXPECT_TRUE(logged("INFO", "================= Rename entry confirmed (nav)"));
}

TEST_F(NavMoveTest, RenameBeginsWithTheNameThatPeopleSee) {
  const URL file = addFile("Notes.pdf");
  memory.disk.items.at(file.path()).values[ResourceKey::LocalizedName] = Value("Notes");
  nav->showRenamePrompt(file);
  EXPECT_EQ(prompt()->textField()->text(), "Notes");
}

TEST_F(NavMoveTest, ARenameThatFailsKeepsThePromptOpen) {
  const URL file = addFile("Notes.pdf");
  addFile("Taken.pdf");
  nav->showRenamePrompt(file);
  type("Taken");
  EXPECT_FALSE(pressDone());
  EXPECT_EQ(errorLine(), "Name is already taken");
  type("Free");
  EXPECT_EQ(errorLine(), "");
  EXPECT_TRUE(pressDone());
  EXPECT_TRUE(isThere(Drive.appendingPathComponent("Free.pdf")));
}

TEST_F(NavMoveTest, TheSameNameClosesThePromptAndMovesNothing) {
  const URL file = addFile("Notes.pdf");
  nav->showRenamePrompt(file);
  EXPECT_TRUE(pressDone());
  EXPECT_TRUE(isThere(file));
  EXPECT_TRUE(loggedStarting("DEBUG", "Rename: Old and new URLs are the same: "));
}

TEST_F(NavMoveTest, SpecialAndMissingItemsAreNotRenamed) {
  const URL documents = addFolder("Documents");
  nav->showRenamePrompt(documents);
  EXPECT_EQ(prompt(), nullptr);
  EXPECT_TRUE(logged("WARNING", "Not renaming special folder: " + documents.absoluteString()));
  ASSERT_NE(presentedAlert(), nullptr);
  nav->dismissViewControllerAnimated(false);
  for (const char* gone : {"gone", "Desktop"}) {
    nav->showRenamePrompt(Drive.appendingPathComponent(gone));
    EXPECT_EQ(presentedAlert(), nullptr) << gone;
    EXPECT_EQ(prompt(), nullptr) << gone;
  }
  EXPECT_FALSE(
      loggedStarting("WARNING", "Not renaming special folder: " + Drive.appendingPathComponent("Desktop").absoluteString()))
      << "what is not there is nothing special";
}

TEST_F(NavMoveTest, AnEmptyNameIsNeitherTakenNorExplained) {
  nav->showRenamePrompt(addFile("Notes.pdf"));
  bool accepted = false;
  EXPECT_EQ(prompt()->validateNewFilenameCallback()("", accepted), "");
  EXPECT_FALSE(accepted);
  EXPECT_FALSE(logged("INFO", "================= Rename entry confirmed (nav)"));
  nav->promtForNewFolderAndCreate();
  EXPECT_EQ(prompt()->validateNewFilenameCallback()("", accepted), "");
  EXPECT_FALSE(accepted);
  EXPECT_FALSE(logged("INFO", "================= New Folder name entry Confirmed"));
}

}  // namespace
}  // namespace vaelo
