// SPDX-License-Identifier: GPL-3.0-or-later
#include <gmock/gmock.h>

#include "app/main.h"
#include "app/settings.h"
#include "tests/unit/nav_review_fixture.h"

namespace vaelo {
namespace {

using ::testing::ElementsAre;

/// A screen that counts how often it is told to go.
struct LeavingScreen : ViewController {
  void viewWillDisappear(bool animated) override {
    ++disappearances;
    ViewController::viewWillDisappear(animated);
  }
  int disappearances = 0;
};

/// Each route ends where it should, and says no more than it should.
class AppReviewRoutesTest : public NavReviewTest {
 protected:
  void choose(const URL& url) {
    topList()->userSelectedItem(url);
    runMainQueue();
  }
  void expectNothingOpened() {
    EXPECT_EQ(countOf("openInDefaultApp returned"), 0u);
    EXPECT_EQ(nav->itemManager(), nullptr);
  }
};

TEST_F(AppReviewRoutesTest, aProgramWithoutAnyArgumentStartsAsWell) {
  EXPECT_EQ(vaeloMain(0, nullptr), exitStatusOfLoop());
  EXPECT_TRUE(logged("INFO", "Running "));
}

TEST_F(AppReviewRoutesTest, aBookmarkThatCannotBeDecodedIsLoggedWithItsError) {
  const Error error{FileErrorDomain, FileErrorCode::NoSuchFile, {}, "gone", {}};
  memory.provider.documents.insert_or_assign("?", error);
  launch();
  continueActivity(Settings::batonVaeloActivityType(), {{UserActivityDocumentURLKey, "?"}});
  runAllQueues();
  EXPECT_TRUE(logged("ERROR", "Baton failed to decode bookmark: " + error.description()));
}

TEST_F(AppReviewRoutesTest, aDecodedDocumentBesideAnErrorIsNotShown) {
  Result<URL> both(document);
  both.error = Error{FileErrorDomain, FileErrorCode::NoSuchFile, {}, "gone", {}};
  memory.provider.documents.insert_or_assign("?", both);
  launch();
  continueActivity(Settings::batonVaeloActivityType(), {{UserActivityDocumentURLKey, "?"}});
  runAllQueues();
  expectNothingOpened();
}

// Lists.

TEST_F(AppReviewRoutesTest, theRootIsConfiguredBeforeItIsShownAndWhenItIs) {
  loadNav();
  EXPECT_EQ(countOf("New DLC ("), 2u);
}

TEST_F(AppReviewRoutesTest, aStackForSomebodyHasItsToolbarEvenWithoutAList) {
  loadNav();
  nav->setToolbarHidden(true);
  makeNoRootList();
  nav->setupInitialViewController();
  EXPECT_FALSE(nav->toolbarHidden());
}

TEST_F(AppReviewRoutesTest, configuringAListRestoresItsTitleAndItsWayBack) {
  loadNav();
  const auto list = makeList(addFolder("Plans"));
  list->navigationItem().setTitle("another");
  list->navigationItem().setHidesBackButton(true, false);
  nav->initNewListController(list);
  EXPECT_EQ(list->navigationItem().title(), "Plans");
  EXPECT_FALSE(list->navigationItem().hidesBackButton());
}

TEST_F(AppReviewRoutesTest, aListThatIsShownAgainHasItsLineBroughtUpToDate) {
  loadNav();
  const auto root = topList();
  root->itemsLoaded({document});
  const std::string one = statusText();
  nav->setEditModeAndUpdateUIForViewController(true, root);
  nav->pushViewController(std::make_shared<ViewController>(), false);
  root->itemsLoaded(std::vector<URL>{document, other});
  nav->popViewControllerAnimated(false);
  EXPECT_TRUE(nav->editMode());
  EXPECT_NE(statusText(), one);
}

TEST_F(AppReviewRoutesTest, theTopScreenIsToldWhenWeGo) {
  loadNav();
  const auto top = std::make_shared<LeavingScreen>();
  nav->pushViewController(top, false);
  nav->beginAppearanceTransition(true, false);
  nav->endAppearanceTransition();
  nav->beginAppearanceTransition(false, false);
  EXPECT_EQ(top->disappearances, 1);
}

TEST_F(AppReviewRoutesTest, thePlaceOfTheDriveIsLoggedAsItsURL) {
  loadNav();
  nav->logContainerURL();
  EXPECT_TRUE(logged("DEBUG", "Vaelo container is at " + memory.cloud.defaultContainerURL()->absoluteString()));
}

// Choosing and pressing.

TEST_F(AppReviewRoutesTest, aChosenFolderIsNotOpenedAsADocument) {
  const URL folder = addFolder("Plans");
  loadNav();
  choose(folder);
  expectNothingOpened();
  makeNoHierarchies();
  choose(folder);
  expectNothingOpened();
  EXPECT_EQ(countOf("Not switching to folder"), 1u);
}

TEST_F(AppReviewRoutesTest, aPressedFolderIsNotOpenedAsADocument) {
  const URL folder = addFolder("Plans");
  loadNav();
  nav->orbPopToURL(folder);
  expectNothingOpened();
  makeNoHierarchies();
  nav->orbPopToURL(folder);
  expectNothingOpened();
}

TEST_F(AppReviewRoutesTest, aRefusedLinkSaysWhyOnceOnly) {
  const URL outside = addOutsideFile("/elsewhere/a.txt");
  loadNav();
  choose(addLink("shortcut", outside));
  EXPECT_EQ(countOf("DLC Selection is symlink"), 1u);
  choose(addLink("dangling", addFolder("Plans").appendingPathComponent("gone")));
  EXPECT_EQ(countOf("DLC Selection is symlink"), 2u);
  expectNothingOpened();
}

TEST_F(AppReviewRoutesTest, aVanishedItemIsNothingMore) {
  loadNav();
  choose(addFolder("Plans").appendingPathComponent("gone.txt"));
  expectNothingOpened();
  EXPECT_EQ(countOf("New DLC ("), 4u) << "one stack before and one after";
}

TEST_F(AppReviewRoutesTest, eachActionOfAnItemCompletesOnce) {
  loadNav();
  for (const int action : {ItemAction::Info, ItemAction::FirmpressPop}) {
    int completions = 0;
    topList()->userChoseAction(action, document, nullptr, [&] { ++completions; });
    EXPECT_EQ(completions, 1);
    nav->popToRootViewControllerAnimated(false);
  }
  EXPECT_EQ(countOf("unexpected value"), 0u);
  EXPECT_TRUE(logged("INFO", "Info action item: " + DRItem::initWithURL(document)->description()));
  EXPECT_THAT(userActions(), ElementsAre("DLC Action Info", "DLC Action Firmpress Pop"));
}

}  // namespace
}  // namespace vaelo
