// SPDX-License-Identifier: GPL-3.0-or-later
#include <gmock/gmock.h>

#include "app/peek_folder_view_controller.h"
#include "platform/ui/search_controller.h"
#include "tests/unit/app_fixture.h"

namespace vaelo {
namespace {

using ::testing::Contains;
using ::testing::ElementsAre;
using NavSelectionTest = AppFixture;

TEST_F(NavSelectionTest, AVanishedItemIsToldAndTheStackBuiltAnew) {
  loadNav();
  const auto before = topList();
  before->userSelectedItem(addFolder("Plans").appendingPathComponent("gone.txt"));
  ASSERT_NE(presentedAlert(), nullptr);
  EXPECT_NE(presentedAlert()->title(), "Error exception");
  EXPECT_EQ(nav->topViewController(), before) << "the stack is built anew later, on the main queue";
  runMainQueue();
  EXPECT_NE(nav->topViewController(), before);
  EXPECT_EQ(nav->viewControllers().size(), 1u);
}

TEST_F(NavSelectionTest, NothingIsOpenedInEditMode) {
  const URL document = addFile("a.txt");
  loadNav();
  nav->setEditModeAndUpdateUIForViewController(true, topList());
  topList()->userSelectedItem(document);
  runMainQueue();
  EXPECT_EQ(nav->viewControllers().size(), 1u);
  EXPECT_EQ(nav->itemManager(), nullptr);
  EXPECT_TRUE(logged("DEBUG", "DLC Selection not allowed while in edit mode"));
}

TEST_F(NavSelectionTest, ADocumentThatNoApplicationOwnsIsPreviewed) {
  const URL document = addFile("a.txt");
  makePreviewable(document);
  loadNav();
  topList()->userSelectedItem(document);
  EXPECT_EQ(nav->itemManager(), nullptr) << "the preview comes later, on the main queue";
  runMainQueue();
  EXPECT_EQ(nav->topViewController(), GlimpseItemController::defaultController());
  EXPECT_EQ(nav->itemManager()->mode(), 0);
  EXPECT_TRUE(logged("INFO", "================= Selected Item (dlc)"));
  EXPECT_TRUE(logged("INFO", "Picked URL: " + document.absoluteString()));
  EXPECT_TRUE(logged("DEBUG", "openInDefaultApp returned NO, showing preview"));
  EXPECT_THAT(userActions(), Contains("Selected Item (dlc)"));
}

TEST_F(NavSelectionTest, ADocumentThatCannotBePreviewedShowsItsDetails) {
  const URL document = addFile("a.xyz");
  makeUnpreviewable(document);
  loadNav();
  topList()->userSelectedItem(document);
  runMainQueue();
  ASSERT_NE(nav->itemManager(), nullptr);
  EXPECT_EQ(nav->itemManager()->mode(), 1);
}

TEST_F(NavSelectionTest, APendingPreviewDoesNotKeepTheControllerAlive) {
  const URL document = addFile("a.txt");
  loadNav();
  topList()->userSelectedItem(document);
  const std::weak_ptr<NavController> weak = nav;
  nav = nullptr;
  EXPECT_TRUE(weak.expired());
  runMainQueue();
}

TEST_F(NavSelectionTest, ADocumentThatItsApplicationOpensLeavesTheStack) {
  const URL document = addFile("a.txt");
  giveOwningApplication(document);
  loadNav();
  topList()->userSelectedItem(document);
  runMainQueue();
  EXPECT_EQ(nav->viewControllers().size(), 1u);
  EXPECT_EQ(nav->itemManager(), nullptr);
  EXPECT_TRUE(logged("DEBUG", "openInDefaultApp returned YES, app launched"));
}

TEST_F(NavSelectionTest, ALinkToAFolderOfTheDriveReplacesTheStack) {
  const URL folder = addFolder("Plans/2026");
  const URL link = addLink("shortcut", folder);
  loadNav();
  topList()->userSelectedContainer(makeList(addFolder("Other")));
  topList()->userSelectedItem(link);
  EXPECT_EQ(*topList()->presentedURL(), folder);
  EXPECT_TRUE(logged("DEBUG", "Building DLC stack for symlink to " + URL(folder.path()).absoluteString()));
}

TEST_F(NavSelectionTest, ALinkOutOfTheDriveIsIgnored) {
  const URL outside = addOutsideFile("/elsewhere/a.txt");
  const URL link = addLink("shortcut", outside);
  loadNav();
  topList()->userSelectedItem(link);
  runMainQueue();
  EXPECT_EQ(nav->viewControllers().size(), 1u);
  EXPECT_TRUE(logged("DEBUG", "DLC Selection is symlink to outside target: file:///elsewhere/a.txt"));
}

TEST_F(NavSelectionTest, ALinkToNothingIsIgnored) {
  const URL gone = addFolder("Plans").appendingPathComponent("gone");
  const URL link = addLink("shortcut", gone);
  memory.values.linkTargets.insert_or_assign(link.path(), gone);  // as of a target that goes after the link was followed
  loadNav();
  topList()->userSelectedItem(link);
  runMainQueue();
  EXPECT_EQ(nav->viewControllers().size(), 1u);
  EXPECT_TRUE(logged("DEBUG", "DLC Selection is symlink that didn't resolve to valid target: " + gone.absoluteString()));
}

TEST_F(NavSelectionTest, ALinkToAnAliasOutOfTheDriveIsIgnored) {
  const URL alias = addFile("onward.desktop");
  memory.disk.items.at(alias.path()).aliasTarget = addOutsideFile("/elsewhere/a.txt");
  const URL link = addLink("shortcut", alias);
  loadNav();
  topList()->userSelectedItem(link);
  runMainQueue();
  EXPECT_EQ(nav->viewControllers().size(), 1u);
  EXPECT_TRUE(logged("DEBUG", "DLC Selection is symlink to invalid target: file:///elsewhere/a.txt"));
}

TEST_F(NavSelectionTest, ALinkToADocumentShowsTheDocument) {
  const URL document = addFile("Plans/a.txt");
  const URL link = addLink("shortcut", document);
  loadNav();
  topList()->userSelectedItem(link);
  runMainQueue();
  ASSERT_NE(nav->itemManager(), nullptr);
  EXPECT_EQ(nav->itemManager()->item()->url(), document);
}

TEST_F(NavSelectionTest, AFolderWithoutAStackIsLogged) {
  const URL folder = addFolder("Plans");
  loadNav();
  makeNoHierarchies();
  const auto before = nav->viewControllers();
  topList()->userSelectedItem(folder);
  EXPECT_EQ(nav->viewControllers(), before);
  EXPECT_TRUE(logged("ERROR", "Couldn't build DLC stack for " + folder.absoluteString() + ". Not switching to folder"));
}

TEST_F(NavSelectionTest, ShowingNothingDoesNothing) {
  loadNav();
  nav->showPreviewPreviewMode(nullptr, 0);
  EXPECT_EQ(nav->itemManager(), nullptr);
}

TEST_F(NavSelectionTest, PeekingAtADocumentPreparesItsPreview) {
  const URL document = addFile("a.txt");
  loadNav();
  const auto peek = topList()->viewControllerForPreviewing(document);
  EXPECT_EQ(peek, GlimpseItemController::defaultController());
  ASSERT_NE(nav->itemManager(), nullptr);
  EXPECT_EQ(nav->itemManager()->item()->url(), document);
  EXPECT_EQ(nav->viewControllers().size(), 1u);
  EXPECT_TRUE(logged("INFO", "================= DLC Action Firmpress Peek"));
  EXPECT_TRUE(logged("DEBUG", "DLC asking for PeekVC for " + document.absoluteString()));
}

TEST_F(NavSelectionTest, PeekingAtAPackagePreviewsItAsADocument) {
  const URL package = addFolder("Drawing.sketchbundle");
  loadNav();
  EXPECT_EQ(topList()->viewControllerForPreviewing(package), GlimpseItemController::defaultController());
}

TEST_F(NavSelectionTest, PeekingAtAFolderListsItWithoutASearch) {
  const URL folder = addFolder("Plans");
  loadNav();
  const auto peek = std::dynamic_pointer_cast<PeekFolderViewController>(topList()->viewControllerForPreviewing(folder));
  ASSERT_NE(peek, nullptr);
  EXPECT_EQ(peek->presentedURL(), folder);
  EXPECT_FALSE(peek->shouldShowSearch());
  EXPECT_TRUE(peek->previewActionItems().empty());
}

TEST_F(NavSelectionTest, PeekingAtNothingShowsNothing) {
  loadNav();
  EXPECT_EQ(topList()->viewControllerForPreviewing(addFolder("Plans").appendingPathComponent("gone")), nullptr);
  EXPECT_TRUE(logged("DEBUG", "URL is not a regular file, package, or folder"));
}

TEST_F(NavSelectionTest, PoppingADocumentPushesThePreparedPreview) {
  const URL document = addFile("a.txt");
  loadNav();
  topList()->viewControllerForPreviewing(document);
  bool completed = false;
  topList()->userChoseAction(ItemAction::FirmpressPop, document, nullptr, [&completed] { completed = true; });
  EXPECT_TRUE(completed);
  EXPECT_EQ(nav->topViewController(), GlimpseItemController::defaultController());
  EXPECT_TRUE(logged("INFO", "================= DLC Action Firmpress Pop"));
  EXPECT_TRUE(logged("INFO", "Preview action: " + document.absoluteString()));
  EXPECT_TRUE(logged("DEBUG", "openInDefaultApp returned NO, showing cached Glimpse from Orb"));
}

TEST_F(NavSelectionTest, PoppingWithoutAPreparedPreviewPushesNothing) {
  const URL document = addFile("a.txt");
  loadNav();
  nav->orbPopToURL(document);
  EXPECT_EQ(nav->viewControllers().size(), 1u);
}

TEST_F(NavSelectionTest, PoppingAFolderReplacesTheStack) {
  const URL folder = addFolder("Plans");
  loadNav();
  nav->orbPopToURL(folder);
  EXPECT_EQ(*topList()->presentedURL(), folder);
  EXPECT_TRUE(logged("DEBUG", "Building DLC stack for Firmpress of " + folder.absoluteString()));
}

TEST_F(NavSelectionTest, PoppingASearchResultGoesToItsFolderFirst) {
  const URL document = addFile("Plans/a.txt");
  loadNav();
  topList()->startSearchWithQueryStringBecomeFirstResponder("a", true);
  topList()->viewControllerForPreviewing(document);
  nav->orbPopToURL(document);
  EXPECT_EQ(nav->presentedViewController(), nullptr);
  ASSERT_GT(nav->viewControllers().size(), 2u);
  EXPECT_EQ(nav->topViewController(), GlimpseItemController::defaultController());
  ASSERT_NE(nav->itemManager(), nullptr) << "the folder's list, which was shown on the way, ended nothing";
  EXPECT_EQ(GlimpseItemController::defaultController()->itemManager(), nav->itemManager());
  EXPECT_EQ(nav->itemManager()->item()->url(), document);
  EXPECT_TRUE(nav->itemManager()->filePresenterRegistered());
}

TEST_F(NavSelectionTest, PoppingADocumentOfAnotherApplicationOpensItThere) {
  const URL document = addFile("a.txt");
  giveOwningApplication(document);
  loadNav();
  nav->documentListControllerPerformActionURL(topList(), ItemAction::FirmpressPop, document);
  EXPECT_EQ(nav->viewControllers().size(), 1u);
  EXPECT_TRUE(logged("DEBUG", "openInDefaultApp returned YES, app launched"));
}

TEST_F(NavSelectionTest, TheListStaysWhenADocumentThatWasPoppedIntoAnotherApplicationIsDeleted) {
  const URL document = addFile("Plans/a.txt");
  giveOwningApplication(document);
  loadNav();
  nav->warpToFolderForURL(document);
  topList()->viewControllerForPreviewing(document);
  EXPECT_FALSE(memory.coordination.presenters().empty());
  nav->orbPopToURL(document);
  EXPECT_TRUE(memory.coordination.presenters().empty());
  EXPECT_EQ(nav->itemManager(), nullptr);
  memory.coordination.othersDelete(document);
  runAllQueues();
  EXPECT_EQ(*topList()->presentedURL(), document.deletingLastPathComponent());
}

TEST_F(NavSelectionTest, AnUnknownActionIsLoggedAndCompleted) {
  loadNav();
  bool completed = false;
  topList()->userChoseAction(9, addFile("a.txt"), nullptr, [&completed] { completed = true; });
  EXPECT_TRUE(completed);
  EXPECT_TRUE(logged("ERROR", "performAction:9 -- unexpected value"));
  EXPECT_TRUE(userActions().empty());
  topList()->userChoseAction(9, addFile("a.txt"), nullptr, nullptr);
}

}  // namespace
}  // namespace vaelo
