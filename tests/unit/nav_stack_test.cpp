// SPDX-License-Identifier: GPL-3.0-or-later
#include <gmock/gmock.h>

#include "platform/ui/search_controller.h"
#include "tests/unit/app_fixture.h"

namespace vaelo {
namespace {

using ::testing::ElementsAre;
using ::testing::IsEmpty;
using NavStackTest = AppFixture;

TEST_F(NavStackTest, ShowsTheRootOfTheDriveWhenSomeoneIsSignedIn) {
  loadNav();
  ASSERT_EQ(nav->viewControllers().size(), 1u);
  EXPECT_TRUE(topList()->showsAllContainers());
  EXPECT_FALSE(nav->toolbarHidden());
  EXPECT_NE(nav->quotaFetcher(), nullptr);
  EXPECT_TRUE(logged("DEBUG", "Vaelo is enabled"));
  EXPECT_TRUE(logged("DEBUG", "NavController viewDidLoad"));
  EXPECT_EQ(nav->NavigationController::delegate().get(), nav.get());
  EXPECT_EQ(topList()->delegate().get(), nav.get());
}

TEST_F(NavStackTest, ShowsTheUnavailableScreenWithoutAnAccount) {
  signOut();
  loadNav();
  ASSERT_EQ(nav->viewControllers().size(), 1u);
  EXPECT_EQ(nav->getTopDocumentListController(), nullptr);
  EXPECT_TRUE(nav->toolbarHidden());
  EXPECT_EQ(nav->quotaFetcher(), nullptr);
  EXPECT_TRUE(logged("WARNING", "Vaelo is not enabled"));
}

TEST_F(NavStackTest, TellsThePersonWhenThereIsNoUnavailableScreen) {
  signOut();
  makeNoUnavailableScreen();
  loadNav();
  EXPECT_TRUE(nav->viewControllers().empty());
  EXPECT_TRUE(logged("ERROR", "DriveUnavailableController creation failed"));
  EXPECT_EQ(presentedAlert(), nullptr) << "the alert comes later, on the main queue";
  runMainQueue();
  ASSERT_NE(presentedAlert(), nullptr);
  EXPECT_EQ(presentedAlert()->title(), "");
  EXPECT_EQ(presentedAlert()->message(), "Vaelo is not enabled");
  EXPECT_EQ(nav->getTopDocumentListController(), nullptr);
  EXPECT_TRUE(logged("WARNING", "ERROR: topViewController is nil"));
}

TEST_F(NavStackTest, SaysSoWhenTheRootListCannotBeMade) {
  makeNoRootList();
  loadNav();
  EXPECT_TRUE(logged("ERROR", "DocumentListController creation failed"));
  EXPECT_TRUE(logged("DEBUG", "Contained items: (null)"));
  EXPECT_TRUE(nav->viewControllers().empty());
  EXPECT_NE(nav->quotaFetcher(), nullptr);
}

TEST_F(NavStackTest, AConfiguredListOffersEveryActionButMore) {
  const URL folder = addFolder("Plans");
  const URL document = addFile("Plans/a.txt");
  loadNav();
  const auto list = makeList(folder);
  list->setTitle("Plans");
  list->itemsLoaded({document});
  log().clear();
  nav->initNewListController(list);
  EXPECT_EQ(list->availableActions(), 125u);
  EXPECT_EQ(nav->viewTitle(), "Plans");
  EXPECT_EQ(list->navigationItem().title(), "Plans");
  EXPECT_FALSE(list->navigationItem().hidesBackButton());
  EXPECT_EQ(list->navigationItem().rightBarButtonItem()->title(), "Select");
  EXPECT_EQ(list->view()->backgroundColor(), Color::white());
  EXPECT_EQ(list->delegate().get(), nav.get());
  EXPECT_TRUE(loggedStarting("DEBUG", "New DLC (1 items): \"Plans\", UTI="));
  EXPECT_TRUE(logged("DEBUG", "    .../a.txt"));
  EXPECT_FALSE(logged("WARNING", "Warning: newList title not set"));
}

TEST_F(NavStackTest, WarnsOfAListWithoutATitle) {
  loadNav();
  const auto list = makeList(addFolder("Plans"));
  list->setTitle("");
  nav->initNewListController(list);
  EXPECT_TRUE(logged("WARNING", "Warning: newList title not set"));
}

TEST_F(NavStackTest, AChosenFolderIsPushed) {
  loadNav();
  const auto folder = makeList(addFolder("Plans"));
  topList()->userSelectedContainer(folder);
  ASSERT_EQ(nav->viewControllers().size(), 2u);
  EXPECT_EQ(nav->topViewController(), folder);
  EXPECT_TRUE(logged("INFO", "================= Selected Folder (dlc)"));
  EXPECT_TRUE(logged("INFO", "User selected folder " + folder->presentedURL()->absoluteString()));
  EXPECT_THAT(userActions(), ElementsAre("Selected Folder (dlc)"));
}

TEST_F(NavStackTest, AChosenFolderWithoutAListIsLogged) {
  loadNav();
  nav->documentListControllerDidSelectContainerWithViewController(topList(), nullptr);
  nav->documentListControllerDidSelectContainerWithViewController(topList(),
                                                                  std::make_shared<DocumentListController>(std::nullopt));
  EXPECT_EQ(nav->viewControllers().size(), 1u);
  EXPECT_EQ(log().count("WARNING", "New DLC is nil"), 2u);
}

TEST_F(NavStackTest, NoFolderIsEnteredInEditMode) {
  loadNav();
  nav->setEditModeAndUpdateUIForViewController(true, topList());
  topList()->userSelectedContainer(makeList(addFolder("Plans")));
  EXPECT_EQ(nav->viewControllers().size(), 1u);
  EXPECT_TRUE(logged("WARNING", "DLC Navigation not allowed while in edit mode"));
}

TEST_F(NavStackTest, AFolderAmongSearchResultsIsReachedFromTheRoot) {
  const URL inner = addFolder("Plans/2026");
  loadNav();
  topList()->startSearchWithQueryStringBecomeFirstResponder("2026", true);
  const auto chosen = makeList(inner);
  topList()->userSelectedContainer(chosen);
  EXPECT_EQ(nav->presentedViewController(), nullptr);
  ASSERT_GT(nav->viewControllers().size(), 2u);
  EXPECT_NE(nav->topViewController(), chosen) << "the stack was built anew";
  EXPECT_EQ(*topList()->presentedURL(), inner);
}

TEST_F(NavStackTest, AFolderAmongSearchResultsIsPushedWhenThereIsNoWayDownToIt) {
  loadNav();
  topList()->startSearchWithQueryStringBecomeFirstResponder("x", true);
  const auto chosen = makeList(URL("/nowhere/at/all", true));
  topList()->userSelectedContainer(chosen);
  EXPECT_EQ(nav->presentedViewController(), nullptr);
  ASSERT_EQ(nav->viewControllers().size(), 2u);
  EXPECT_EQ(nav->topViewController(), chosen);
}

TEST_F(NavStackTest, AListWhoseFolderIsGoneIsPopped) {
  loadNav();
  topList()->userSelectedContainer(makeList(addFolder("Plans")));
  topList()->folderWasRemoved();
  EXPECT_EQ(nav->viewControllers().size(), 1u);
}

TEST_F(NavStackTest, ShowingAListTakesItsEditingStateAndShowsTheToolbar) {
  loadNav();
  nav->setEditModeAndUpdateUIForViewController(true, topList());
  nav->setToolbarHidden(true);
  nav->pushViewController(makeList(addFolder("Plans")), false);
  EXPECT_FALSE(nav->editMode()) << "the new list is not being edited";
  EXPECT_FALSE(nav->toolbarHidden());
  EXPECT_EQ(topList()->availableActions(), 125u);
}

TEST_F(NavStackTest, AWarpRefusesWhatIsNotInTheDriveButDismissesWhatIsPresented) {
  addOutsideFile("/elsewhere/a.txt");
  loadNav();
  const auto before = nav->viewControllers();
  presentSomething();
  EXPECT_FALSE(nav->warpToNewURLPreviewMode(URL("/elsewhere/a.txt"), 0));
  EXPECT_EQ(nav->presentedViewController(), nullptr);
  EXPECT_EQ(nav->viewControllers(), before);
  EXPECT_TRUE(logged("DEBUG", "Preview URL is not in the Mobile Documents dir: file:///elsewhere/a.txt"));
  presentSomething();
  EXPECT_FALSE(nav->warpToNewURLPreviewMode(std::nullopt, 0));
  EXPECT_EQ(nav->presentedViewController(), nullptr);
}

TEST_F(NavStackTest, AWarpRefusesTheTrash) {
  const URL trashed = addTrashedFile("a.txt");
  loadNav();
  const auto before = nav->viewControllers();
  EXPECT_FALSE(nav->warpToNewURLPreviewMode(trashed, 0));
  EXPECT_EQ(nav->viewControllers(), before);
  EXPECT_TRUE(logged("DEBUG", "Preview URL is in Trash: " + trashed.absoluteString()));
}

TEST_F(NavStackTest, AWarpThatFindsNothingKeepsTheStack) {
  loadNav();
  const auto before = nav->viewControllers();
  const URL gone = addFolder("Plans").appendingPathComponent("no").appendingPathComponent("such");
  EXPECT_FALSE(nav->warpToNewURLPreviewMode(gone, 0));
  EXPECT_EQ(nav->viewControllers(), before);
  EXPECT_TRUE(logged("WARNING", "warpToNewURL failed: " + gone.absoluteString()));
}

TEST_F(NavStackTest, AWarpToAFolderShowsTheListsDownToIt) {
  const URL inner = addFolder("Plans/2026");
  loadNav();
  EXPECT_TRUE(nav->warpToNewURLPreviewMode(inner, 0));
  EXPECT_EQ(*topList()->presentedURL(), inner);
  EXPECT_EQ(nav->itemManager(), nullptr) << "a list that is shown ends the preview";
}

TEST_F(NavStackTest, AWarpToADocumentPutsItsPreviewOnTop) {
  const URL document = addFile("Plans/a.txt");
  loadNav();
  EXPECT_TRUE(nav->warpToNewURLPreviewMode(document, 0));
  EXPECT_EQ(nav->topViewController(), GlimpseItemController::defaultController());
  ASSERT_NE(nav->itemManager(), nullptr);
  EXPECT_EQ(nav->itemManager()->item()->url(), document);
  EXPECT_FALSE(loggedStarting("WARNING", "warpToNewURL failed"));
  EXPECT_EQ(nav->itemManager()->mode(), 0);
}

TEST_F(NavStackTest, SearchWaitsForTheRootList) {
  loadNav();
  topList()->userSelectedContainer(makeList(addFolder("Plans")));
  presentSomething();
  nav->startSearch("needle");
  EXPECT_EQ(nav->presentedViewController(), nullptr);
  EXPECT_EQ(nav->viewControllers().size(), 1u);
  advance(std::chrono::milliseconds(699));
  EXPECT_EQ(nav->presentedViewController(), nullptr);
  advance(std::chrono::milliseconds(1));
  const auto search = std::dynamic_pointer_cast<SearchController>(nav->presentedViewController());
  ASSERT_NE(search, nullptr);
  EXPECT_EQ(search->query(), "needle");
  EXPECT_TRUE(search->wantsFocus());
}

TEST_F(NavStackTest, TheContainersPlaceCanBeLogged) {
  loadNav();
  nav->logContainerURL();
  EXPECT_TRUE(loggedStarting("DEBUG", "Vaelo container is at file:///"));
  signOut();
  nav->logContainerURL();
  EXPECT_TRUE(logged("DEBUG", "Vaelo is not available"));
}

TEST_F(NavStackTest, StateKeepsThePreviewedDocumentAndItsMode) {
  const URL document = addFile("Plans/a.txt");
  loadNav();
  nav->warpToNewURLPreviewMode(document, 1);
  DictionaryRestorationCoder coder;
  nav->encodeRestorableStateWithCoder(coder);
  ASSERT_NE(coder.decode("url").get<URL>(), nullptr);
  EXPECT_EQ(*coder.decode("url").get<URL>(), document);
  EXPECT_EQ(coder.decode("PreviewMode").signedValue(), 1);
}

TEST_F(NavStackTest, StateWithoutAPreviewKeepsNothing) {
  loadNav();
  DictionaryRestorationCoder coder;
  nav->encodeRestorableStateWithCoder(coder);
  EXPECT_THAT(coder.values(), IsEmpty());
}

TEST_F(NavStackTest, RestoresThePreviewOfADocumentOnly) {
  const URL document = addFile("Plans/a.txt");
  const URL folder = addFolder("Plans");
  loadNav();
  nav->decodeRestorableStateWithCoder(DictionaryRestorationCoder());
  nav->decodeRestorableStateWithCoder(DictionaryRestorationCoder({{"url", folder}, {"PreviewMode", std::int64_t{1}}}));
  nav->decodeRestorableStateWithCoder(DictionaryRestorationCoder({{"url", URL("/gone")}}));
  EXPECT_EQ(nav->itemManager(), nullptr);
  nav->decodeRestorableStateWithCoder(DictionaryRestorationCoder({{"url", document}, {"PreviewMode", std::int64_t{1}}}));
  ASSERT_NE(nav->itemManager(), nullptr);
  EXPECT_EQ(nav->itemManager()->mode(), 1);
  EXPECT_EQ(nav->itemManager()->item()->url(), document);
}

}  // namespace
}  // namespace vaelo
