// SPDX-License-Identifier: GPL-3.0-or-later
// Edit mode: its bars, and how they follow the selection.
#include <gmock/gmock.h>

#include "platform/ui/button.h"
#include "tests/unit/app_fixture.h"

namespace vaelo {
namespace {

using ::testing::ElementsAre;
using ::testing::SizeIs;

class NavEditTest : public AppFixture {
 protected:
  NavEditTest() {
    loadNav();
    folder = makeList(addFolder("Plans"));
    folder->setTitle("Plans");
    nav->pushViewController(folder, false);
    nav->initNewListController(folder);
    folder->itemsLoaded({a, b});
    log().clear();
  }
  NavigationItem& bar() { return folder->navigationItem(); }
  void edit() { bar().rightBarButtonItem()->press(); }
  std::string titleOf(const BarButtonItemRef& item) {
    const auto button = std::dynamic_pointer_cast<Button>(item->customView());
    return button ? button->title() : "";
  }

  const URL a = addFile("Plans/a.txt");
  const URL b = addFile("Plans/b.txt");
  std::shared_ptr<DocumentListController> folder;
};

TEST_F(NavEditTest, SelectBeginsEditModeWithNothingSelected) {
  EXPECT_EQ(bar().rightBarButtonItem()->title(), "Select");
  EXPECT_EQ(bar().rightBarButtonItem()->style(), BarButtonStyle::Plain);
  edit();
  EXPECT_TRUE(nav->editMode());
  EXPECT_TRUE(folder->editing());
  EXPECT_TRUE(logged("INFO", "================= Pressed Select (begin edit)"));
  EXPECT_TRUE(logged("INFO", "Begin Edit mode"));
  EXPECT_EQ(bar().rightBarButtonItem()->systemItem(), SystemItem::Cancel);
  EXPECT_TRUE(bar().hidesBackButton());
  EXPECT_EQ(bar().title(), "Select Items");
}

TEST_F(NavEditTest, TheToolbarHasThreeButtons) {
  edit();
  const auto& items = folder->toolbarItems();
  ASSERT_THAT(items, SizeIs(5));
  EXPECT_EQ(items[0], nav->barButtonNewFolder());
  EXPECT_EQ(items[2], nav->barButtonMoveItem());
  EXPECT_EQ(items[4], nav->barButtonDeleteItem());
  EXPECT_EQ(items[1]->systemItem(), SystemItem::FlexibleSpace);
  EXPECT_EQ(items[1], items[3]);
  EXPECT_EQ(titleOf(items[0]), "New Folder");
  EXPECT_EQ(titleOf(items[2]), "Move");
  EXPECT_EQ(titleOf(items[4]), "Delete");
  EXPECT_GT(items[0]->customView()->frame().width, 0) << "sized to fit";
  EXPECT_EQ(std::static_pointer_cast<Button>(items[0]->customView())->type(), ButtonType::System);
  EXPECT_TRUE(items[0]->enabled());
  EXPECT_FALSE(items[2]->enabled());
  EXPECT_FALSE(items[4]->enabled());
}

TEST_F(NavEditTest, TheButtonsStartTheirFlows) {
  edit();
  folder->setSelectedItems({a});
  nav->barButtonNewFolder()->press();
  EXPECT_TRUE(logged("INFO", "Pressed NewFolder"));
  nav->dismissViewControllerAnimated(false);
  nav->barButtonDeleteItem()->press();
  EXPECT_TRUE(loggedStarting("INFO", "Pressed Delete after selecting 1 items: "));
  nav->dismissViewControllerAnimated(false);
  nav->barButtonMoveItem()->press();
  EXPECT_TRUE(logged("INFO", "Pressed Move"));
}

TEST_F(NavEditTest, TheSelectionIsCountedAndJudged) {
  edit();
  const BarButtonItemRef newFolder = nav->barButtonNewFolder();
  newFolder->setEnabled(false);
  folder->setSelectedItems({a});
  EXPECT_EQ(bar().title(), "selected: 1");
  folder->setSelectedItems({a, b});
  EXPECT_EQ(bar().title(), "selected: 2");
  EXPECT_TRUE(logged("DEBUG", "DLC selected item count is 2"));
  EXPECT_TRUE(nav->barButtonMoveItem()->enabled());
  EXPECT_TRUE(nav->barButtonDeleteItem()->enabled());
  EXPECT_FALSE(newFolder->enabled()) << "judged only when edit mode begins";
  folder->setSelectedItems({});
  EXPECT_EQ(bar().title(), "Select Items");
  EXPECT_FALSE(nav->barButtonMoveItem()->enabled());
}

TEST_F(NavEditTest, NewFolderIsJudgedWhenEditModeBegins) {
  const auto library = memory.cloud.addContainer("org~example~Notes", "Notes");
  library->levels = FolderLevelsNone;
  const auto list = makeList(*library->documentsFolderURL());
  nav->pushViewController(list, false);
  nav->setEditModeAndUpdateUIForViewController(true, list);
  EXPECT_FALSE(nav->barButtonNewFolder()->enabled());
}

TEST_F(NavEditTest, CancelRestoresTheListsBars) {
  edit();
  folder->setSelectedItems({a});
  edit();  // the same button, now Cancel
  EXPECT_FALSE(nav->editMode());
  EXPECT_FALSE(folder->editing());
  EXPECT_TRUE(logged("INFO", "================= Pressed Cancel (end edit)"));
  EXPECT_TRUE(logged("DEBUG", "EndEditMode.  Selected 1 items: (" + a.absoluteString() + ")"));
  EXPECT_EQ(bar().title(), "Plans");
  EXPECT_FALSE(bar().hidesBackButton());
  EXPECT_EQ(bar().rightBarButtonItem()->title(), "Select");
  EXPECT_EQ(folder->toolbarItems(), statusBarOf(*folder)->toolbarItems());
  EXPECT_EQ(nav->barButtonNewFolder(), nullptr);
  EXPECT_EQ(nav->barButtonMoveItem(), nullptr);
  EXPECT_EQ(nav->barButtonDeleteItem(), nullptr);
}

TEST_F(NavEditTest, SelectAllTakesEveryItem) {
  edit();
  nav->selectAllItems(nullptr);
  EXPECT_THAT(folder->selectedItems(), ElementsAre(a, b));
  EXPECT_EQ(bar().title(), "selected: 2");
  EXPECT_TRUE(logged("INFO", "================= Pressed SelectAll"));
  EXPECT_TRUE(logged("INFO", "Pressed SelectAll"));
  EXPECT_TRUE(logged("DEBUG", "DLC has 2 contained items"));
  EXPECT_TRUE(loggedStarting("DEBUG", "Selected all 2: ("));
}

TEST_F(NavEditTest, SelectAllDoesNotAskForEditMode) {
  nav->selectAllItems(nullptr);
  EXPECT_THAT(folder->selectedItems(), ElementsAre(a, b));
  EXPECT_EQ(bar().title(), "Plans");
}

TEST_F(NavEditTest, TheTitleDoesNotWaitForTheItems) {
  nav = std::make_shared<NavController>();
  nav->view();
  const auto list = makeList(addFolder("Other"));
  nav->pushViewController(list, false);
  ASSERT_FALSE(nav->pickerIsAlive());
  nav->setEditModeAndUpdateUIForViewController(true, list);
  EXPECT_EQ(list->navigationItem().title(), "Select Items");
}

TEST_F(NavEditTest, SelectAllWithoutAListSelectsNothing) {
  nav->pushViewController(std::make_shared<ViewController>(), false);
  nav->selectAllItems(nullptr);
  EXPECT_TRUE(logged("INFO", "Pressed SelectAll"));
  EXPECT_THAT(folder->selectedItems(), ElementsAre());
}

TEST_F(NavEditTest, AListThatIsNotOnTopChangesNothing) {
  const auto other = makeList(addFolder("Other"));
  nav->initNewListController(other);
  nav->initNewListController(folder);
  edit();
  log().clear();
  other->itemsLoaded({a});
  EXPECT_TRUE(nav->pickerIsAlive());
  EXPECT_EQ(bar().title(), "Select Items");
  EXPECT_TRUE(log().lines().empty());
}

}  // namespace
}  // namespace vaelo
