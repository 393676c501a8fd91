// SPDX-License-Identifier: GPL-3.0-or-later
// What the flows that change the tree present, and what of it is animated.
#include <gmock/gmock.h>

#include "fileops/filename_prompt.h"
#include "tests/unit/nav_review_fixture.h"

namespace vaelo {
namespace {

using ::testing::ElementsAre;

class NavReviewFlowsTest : public NavReviewTest {
 protected:
  NavReviewFlowsTest() {
    loadShownNav();
    shown.changes.clear();
  }
};

TEST_F(NavReviewFlowsTest, TheQuestionBeforeADeletionComesAnimated) {
  nav->showWarningAndDeleteURLsUsingViewWithDocumentListControllerFinishedCompletion({document}, nullptr, nullptr, nullptr);
  EXPECT_THAT(shown.changes, ElementsAre("present, animated"));
}

TEST_F(NavReviewFlowsTest, ThePickerComesAndGoesAnimated) {
  nav->showMoveTargetForItemsInFolder({document}, Drive.appendingPathComponent("Plans", true));
  EXPECT_THAT(shown.changes, ElementsAre("present, animated"));
  const auto picker = std::dynamic_pointer_cast<DocumentTargetSelectionController>(nav->presentedViewController());
  ASSERT_NE(picker, nullptr);
  picker->userSelected(Drive);
  EXPECT_THAT(shown.changes, ElementsAre("present, animated", "dismiss, animated"));
}

TEST_F(NavReviewFlowsTest, ThePromptForAFolderComesAnimated) {
  nav->showNewFolderPromptDuringMoveItemsToMove(Drive, {});
  EXPECT_THAT(shown.changes, ElementsAre("present, animated"));
}

TEST_F(NavReviewFlowsTest, ANewPromptTakesThePlaceOfTheOneBefore) {
  nav->showNewFolderPromptDuringMoveItemsToMove(Drive, {});
  const std::weak_ptr<FilenamePrompt> first = nav->folderPromptAlert();
  nav->dismissViewControllerAnimated(false);
  EXPECT_FALSE(first.expired()) << "kept for as long as no other comes";
  nav->showRenamePrompt(document);
  EXPECT_TRUE(first.expired());
  EXPECT_NE(nav->folderPromptAlert(), nullptr);
}

}  // namespace
}  // namespace vaelo
