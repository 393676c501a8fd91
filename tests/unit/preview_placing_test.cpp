// SPDX-License-Identifier: GPL-3.0-or-later
// What is animated as previews come, take each other's place and go, and in which order.
#include "platform/ui/search_controller.h"
#include "tests/unit/animation_recorder.h"
#include "tests/unit/preview_fixture.h"

namespace vaelo {
namespace {

using ::testing::ElementsAre;
using ::testing::IsEmpty;

class PreviewPlacingTest : public PreviewFixture {
 protected:
  PreviewPlacingTest() {
    window->setPresentationHost(&shown);
    nav->setHost(&shown);
  }
  ~PreviewPlacingTest() override {
    nav->setHost(nullptr);
    window->setPresentationHost(nullptr);
  }
  /// Of the first line with that text; the number of lines when there is none.
  std::size_t lineOf(const std::string& text) {
    const std::vector<std::string> lines = log().lines();
    std::size_t line = 0;
    while (line < lines.size() && lines[line].find(text) == std::string::npos) ++line;
    return line;
  }

  AnimationRecorder shown;
};

TEST_F(PreviewPlacingTest, APreviewIsPushedButTakesTheFormerOnesPlaceAtOnce) {
  show();
  EXPECT_THAT(shown.changes, ElementsAre("stack, animated"));
  show(1);
  EXPECT_THAT(shown.changes, ElementsAre("stack, animated", "stack"));
}

TEST_F(PreviewPlacingTest, ThePreviewComesWhenTheSearchIsGone) {
  topList()->startSearchWithQueryStringBecomeFirstResponder("rep", true);
  shown.changes.clear();
  shown.holdsDismissals = true;
  const auto manager = show();
  EXPECT_THAT(shown.changes, ElementsAre("dismiss, animated"));
  EXPECT_NE(top(), glimpse());
  shown.finishDismissals();
  EXPECT_THAT(shown.changes, ElementsAre("dismiss, animated", "stack, animated"));
  EXPECT_EQ(top(), glimpse());
}

TEST_F(PreviewPlacingTest, APreviewOnTopIsReplacedUnderneathASearch) {
  const DocumentListControllerRef list = topList();
  show();
  nav->presentViewController(std::make_shared<SearchController>(list, "", false), false);
  shown.changes.clear();
  show(1);
  EXPECT_THAT(shown.changes, ElementsAre("stack"));
}

TEST_F(PreviewPlacingTest, WhatElseIsPresentedStays) {
  presentSomething();
  shown.changes.clear();
  show();
  EXPECT_THAT(shown.changes, ElementsAre("stack, animated"));
  EXPECT_NE(nav->presentedViewController(), nullptr);
}

TEST_F(PreviewPlacingTest, AWarpDismissesAtOnceThenGoesThere) {
  const auto manager = makeManager();
  presentSomething();
  shown.changes.clear();
  EXPECT_TRUE(manager->warpToNewURL(document));
  EXPECT_THAT(shown.changes, ElementsAre("dismiss", "stack, animated"));
  EXPECT_LT(lineOf("New VC stack of DLCs: "), lineOf("Preview: Using "));
  EXPECT_LT(lineOf("Preview: Using "), lineOf("Previewing "));
}

TEST_F(PreviewPlacingTest, AWarpThatCannotBeMadeDismissesNothing) {
  const auto manager = show();
  runAllQueues();
  presentSomething();
  shown.changes.clear();
  EXPECT_FALSE(manager->warpToNewURL(Drive.appendingPathComponent("gone/x.pdf")));
  makeNoHierarchies();
  EXPECT_FALSE(manager->warpToNewURL(document));
  EXPECT_THAT(shown.changes, IsEmpty());
  EXPECT_TRUE(activities().back()->isCurrent());
  EXPECT_FALSE(loggedStarting("DEBUG", "New VC stack of DLCs: "));
}

TEST_F(PreviewPlacingTest, AWarpToTheSameDocumentFollowsItAnew) {
  const auto manager = show();
  runAllQueues();
  const auto former = activities().back();
  EXPECT_TRUE(manager->warpToNewURL(document));
  EXPECT_FALSE(former->isCurrent());
  EXPECT_TRUE(manager->filePresenterRegistered());
}

TEST_F(PreviewPlacingTest, AWarpToABookmarkOfNothingEndsInItsFolder) {
  const URL bookmark = addFile("Plans/Gone.vaelobookmark");
  const auto manager = makeManager();
  EXPECT_TRUE(manager->warpToNewURL(bookmark));
  ASSERT_NE(topList(), nullptr);
  EXPECT_EQ(topList()->presentedURL()->path(), bookmark.deletingLastPathComponent().path());
  EXPECT_EQ(manager->item()->url(), bookmark);
  EXPECT_TRUE(logged("WARNING", "no preview URL, nothing to show"));
}

TEST_F(PreviewPlacingTest, WithoutANavigationControllerAWarpStillTakesTheItem) {
  const auto orphan = PreviewItemManager::newItemManagerWithModeNavController(0, nullptr);
  EXPECT_TRUE(orphan->warpToNewURL(document));
  EXPECT_EQ(orphan->item()->url(), document);
  EXPECT_THAT(shown.changes, IsEmpty());
}

TEST_F(PreviewPlacingTest, ADeletedDocumentsPreviewIsPoppedWithAnimation) {
  const auto manager = show();
  shown.changes.clear();
  memory.coordination.othersDelete(document);
  runAllQueues();
  EXPECT_THAT(shown.changes, ElementsAre("stack, animated"));
  EXPECT_NE(top(), glimpse());
}

TEST_F(PreviewPlacingTest, AMovedDocumentsPreviewIsReplacedAtOnce) {
  const auto manager = show(1);
  shown.changes.clear();
  const URL moved = addFolder("Archive").appendingPathComponent("Report.pdf");
  memory.disk.move(document.path(), moved.path());
  memory.coordination.othersMoved(document, moved);
  runAllQueues();
  EXPECT_THAT(shown.changes, ElementsAre("stack"));
}

TEST_F(PreviewPlacingTest, ThePickerComesAndGoesWithAnimationBeforeAnythingMoves) {
  const auto manager = show();
  const URL folder = addFolder("Archive");
  addFile("Archive/Report.pdf");
  shown.changes.clear();
  manager->showMoveTarget(glimpse());
  EXPECT_THAT(shown.changes, ElementsAre("present, animated"));
  std::dynamic_pointer_cast<DocumentTargetSelectionController>(nav->presentedViewController())->userSelected(folder);
  EXPECT_THAT(shown.changes, ElementsAre("present, animated", "dismiss, animated", "present, animated"))
      << "at last the alert, that there is such an item already";
}

}  // namespace
}  // namespace vaelo
