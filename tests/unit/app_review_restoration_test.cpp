// SPDX-License-Identifier: GPL-3.0-or-later
#include <gmock/gmock.h>

#include "tests/unit/nav_review_fixture.h"

namespace vaelo {
namespace {

using ::testing::IsEmpty;
using ::testing::SizeIs;

/// The next start shows the folder that the last one ended with.
class AppReviewRestorationTest : public NavReviewTest {
 protected:
  DictionaryRestorationCoder encoded() {
    DictionaryRestorationCoder coder;
    nav->encodeRestorableStateWithCoder(coder);
    return coder;
  }
  void restart(const DictionaryRestorationCoder& state) {
    loadNav();
    nav->decodeRestorableStateWithCoder(state);
  }
};

TEST_F(AppReviewRestorationTest, theListsDownToTheFolderComeBack) {
  const URL folder = addFolder("Plans/2026");
  loadNav();
  nav->warpToFolderForURL(folder);
  const auto state = encoded();
  EXPECT_THAT(state.values(), SizeIs(1));
  restart(state);
  EXPECT_THAT(nav->viewControllers(), SizeIs(3));
  EXPECT_EQ(topList()->presentedURL(), folder);
  EXPECT_EQ(topList()->availableActions(), 125u) << "configured as any list that is shown";
}

TEST_F(AppReviewRestorationTest, theRootListNeedsNoKeeping) {
  loadNav();
  EXPECT_THAT(encoded().values(), IsEmpty());
  signOut();
  nav->setupInitialViewController();
  EXPECT_THAT(encoded().values(), IsEmpty());
}

TEST_F(AppReviewRestorationTest, aPreviewComesBackOverItsFolder) {
  loadNav();
  previewing(document);
  const auto state = encoded();
  restart(state);
  EXPECT_EQ(previewed(), document);
  ASSERT_THAT(nav->viewControllers(), SizeIs(3));
  const auto below = std::dynamic_pointer_cast<DocumentListController>(nav->viewControllers()[1]);
  ASSERT_NE(below, nullptr);
  EXPECT_EQ(below->presentedURL(), addFolder("Plans"));
  EXPECT_EQ(nav->topViewController(), GlimpseItemController::defaultController());
}

TEST_F(AppReviewRestorationTest, aFolderThatIsGoneOrNoFolderAnyMoreLeavesTheRoot) {
  for (const URL& place : {addFolder("Plans").appendingPathComponent("gone"), document}) {
    restart(DictionaryRestorationCoder({{"ListFolder", place}}));
    EXPECT_THAT(nav->viewControllers(), SizeIs(1));
  }
  restart(DictionaryRestorationCoder({{"ListFolder", addFolder("Plans").path()}}));
  EXPECT_THAT(nav->viewControllers(), SizeIs(1)) << "no URL";
  makeNoHierarchies();
  restart(DictionaryRestorationCoder({{"ListFolder", addFolder("Plans")}}));
  EXPECT_THAT(nav->viewControllers(), SizeIs(1)) << "no longer in the drive";
}

TEST_F(AppReviewRestorationTest, theFolderComesBackAtOnce) {
  const URL folder = addFolder("Plans");
  loadShownNav();
  nav->decodeRestorableStateWithCoder(DictionaryRestorationCoder({{"ListFolder", folder}}));
  EXPECT_THAT(shown.stacks, ::testing::ElementsAre(false));
}

}  // namespace
}  // namespace vaelo
