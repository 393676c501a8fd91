// SPDX-License-Identifier: GPL-3.0-or-later
#include "app/drive_status_label_view.h"

#include <gtest/gtest.h>

#include "tests/support/memory_platform.h"
#include "tests/support/memory_upgrade_button.h"

namespace vaelo {
namespace {

/// Letters are 5 points wide and as high as their font: 11 for the line, 17 for the button's title. A button is its title
/// with 6 points around it.
class DriveStatusLabelViewTest : public testing::Test {
 protected:
  DriveStatusLabelViewTest() {
    label->setFont(Font::preferred(TextStyle::Caption2));
    button->setTitle("Upgrade");
    view->setPrimaryLabel(label);
    view->setQuotaButton(button);
    button->setHidden(true);
  }
  void layOut(double width, double height) {
    view->setFrame({0, 0, width, height});
    view->layoutIfNeeded();
  }

  MemoryPlatform memory;
  std::shared_ptr<DriveStatusLabelView> view = DriveStatusLabelView::initWithFrame({});
  std::shared_ptr<Label> label = std::make_shared<Label>();
  std::shared_ptr<MemoryUpgradeButton> button = std::make_shared<MemoryUpgradeButton>(nullptr, false);
};

TEST_F(DriveStatusLabelViewTest, BeginsFlexibleAndWithoutAButton) {
  EXPECT_EQ(view->autoresizingMask(), FlexibleWidth | FlexibleHeight);
  EXPECT_FALSE(view->opaque());
  EXPECT_FALSE(view->showLowQuota());
  const auto bare = DriveStatusLabelView::initWithFrame({1, 2, 3, 4});
  EXPECT_EQ(bare->frame(), (Rect{1, 2, 3, 4}));
  bare->layoutIfNeeded();  // without label and button there is nothing to place
  EXPECT_TRUE(bare->subviews().empty());
}

TEST_F(DriveStatusLabelViewTest, ATextIsMeasuredAndAsksForLayout) {
  layOut(360, 46);
  EXPECT_FALSE(view->needsLayout());
  view->setPrimaryLabelText("1234567890");
  EXPECT_EQ(label->frame().size(), (Size{50, 11}));
  EXPECT_TRUE(view->needsLayout());
}

TEST_F(DriveStatusLabelViewTest, TheButtonIsHiddenExactlyWhileThereIsRoomInTheAccount) {
  layOut(360, 46);
  view->showLowQuota(true);
  EXPECT_TRUE(view->showLowQuota());
  EXPECT_FALSE(button->hidden());
  EXPECT_TRUE(view->needsLayout());
  view->showLowQuota(false);
  EXPECT_TRUE(button->hidden());
}

// (360 - 25) / 2 = 167.5
TEST_F(DriveStatusLabelViewTest, LayoutMeasuresTheLineAgain) {
  view->setPrimaryLabelText("1234567890");
  label->setText("12345");
  layOut(360, 46);
  EXPECT_EQ(label->frame().x, 167.5);
  EXPECT_EQ(label->frame().size(), (Size{25, 11}));
}

// x: (360 - 50) / 2 = 155. y: the block is the label alone, (46 - 11) / 2 - 1 = 16.5, a whole pixel at two pixels a point.
TEST_F(DriveStatusLabelViewTest, ALineAloneIsCentredAndRaisedByAPoint) {
  view->setPrimaryLabelText("1234567890");
  layOut(360, 46);
  EXPECT_EQ(label->frame(), (Rect{155, 16.5, 50, 11}));
}

// Without a gap: 0 + (16.5 + 11) - 6 = 21.5.
TEST_F(DriveStatusLabelViewTest, AHiddenButtonStandsCloseUnderTheLine) {
  view->setPrimaryLabelText("1234567890");
  layOut(360, 46);
  EXPECT_EQ(button->frame(), (Rect{156.5, 21.5, 47, 29}));
}

// A line that keeps its 11 points without a text counts for none in the block, but its bottom and the gap of 2.75 are where
// they are. Alone: (46 - 0) / 2 - 1 = 22. With the button: (46 - 2.75 - 17) / 2 - 1 = 12.125, so 12; button y 2.75 + 12 + 11
// - 6 = 19.75, so 20.
TEST_F(DriveStatusLabelViewTest, ALineWithoutATextIsNoPartOfTheBlock) {
  struct TallLabel : Label {
    Size sizeThatFits(const Size&) const override { return {0, 11}; }
  };
  const auto tall = std::make_shared<TallLabel>();
  view->setPrimaryLabel(tall);
  layOut(360, 46);
  EXPECT_EQ(tall->frame(), (Rect{180, 22, 0, 11}));
  view->showLowQuota(true);
  layOut(360, 46);
  EXPECT_EQ(tall->frame(), (Rect{180, 12, 0, 11}));
  EXPECT_EQ(button->frame(), (Rect{156.5, 20, 47, 29}));
}

// Gap 11 / 4 = 2.75; block 2.75 + 17 + 11 = 30.75. Label y: (46 - 30.75) / 2 - 1 = 6.625, in half points 6.5. Button: 47 x
// 29, inset (29 - 17) / 2 = 6; x (360 - 47) / 2 = 156.5; y 2.75 + (6.5 + 11) - 6 = 14.25, in half points 14.5.
TEST_F(DriveStatusLabelViewTest, LineAndButtonAreCentredOneAboveTheOther) {
  view->setPrimaryLabelText("1234567890");
  view->showLowQuota(true);
  layOut(360, 46);
  EXPECT_EQ(label->frame(), (Rect{155, 6.5, 50, 11}));
  EXPECT_EQ(button->frame(), (Rect{156.5, 14.5, 47, 29}));
}

// The same, in whole points: 6.625 is 7; button x 156.5 is 157, y 2.75 + 18 - 6 = 14.75 is 15.
TEST_F(DriveStatusLabelViewTest, OriginsAreOnWholePixels) {
  memory.screens.deviceShown.screen.scale = 1;
  view->setPrimaryLabelText("1234567890");
  view->showLowQuota(true);
  layOut(360, 46);
  EXPECT_EQ(label->frame(), (Rect{155, 7, 50, 11}));
  EXPECT_EQ(button->frame(), (Rect{157, 15, 47, 29}));
}

// In thirds of a point: label y 6.625 * 3 = 19.875, so 20 / 3; button y (2.75 + 20 / 3 + 11 - 6) * 3 = 43.25, so 43 / 3.
TEST_F(DriveStatusLabelViewTest, PixelsMayBeThirdsOfAPoint) {
  memory.screens.deviceShown.screen.scale = 3;
  view->setPrimaryLabelText("1234567890");
  view->showLowQuota(true);
  layOut(360, 46);
  EXPECT_DOUBLE_EQ(label->frame().y, 20.0 / 3);
  EXPECT_DOUBLE_EQ(button->frame().y, 43.0 / 3);
  EXPECT_DOUBLE_EQ(button->frame().x, 470.0 / 3);  // 156.5 * 3 = 469.5
}

// Without a text the label is 0 x 0, so the gap is 0 and the block the title's 17. Label y: (46 - 17) / 2 - 1 = 13.5; button
// y: 0 + 13.5 - 6 = 7.5, which puts its title's middle at 7.5 + 14.5 = 22: the view's 23, raised by one.
TEST_F(DriveStatusLabelViewTest, AButtonWithoutALineIsCentredAlone) {
  view->showLowQuota(true);
  layOut(360, 46);
  EXPECT_EQ(label->frame(), (Rect{180, 13.5, 0, 0}));
  EXPECT_EQ(button->frame(), (Rect{156.5, 7.5, 47, 29}));
}

// No line and no button: a block of nothing, (46 - 0) / 2 - 1 = 22.
TEST_F(DriveStatusLabelViewTest, AnEmptyLineTakesNoHeight) {
  layOut(360, 46);
  EXPECT_EQ(label->frame(), (Rect{180, 22, 0, 0}));
}

// A title of no height counts as high as the label, 11: the button is 12 x 12, its inset (12 - 11) / 2 = 0.5. Block
// 2.75 + 11 + 11 = 24.75; label y (46 - 24.75) / 2 - 1 = 9.625, so 9.5; button y 2.75 + 20.5 - 0.5 = 22.75, so 23.
TEST_F(DriveStatusLabelViewTest, ATitleOfNoHeightCountsAsHighAsTheLine) {
  button->setTitle("");
  view->setPrimaryLabelText("1234567890");
  view->showLowQuota(true);
  layOut(360, 46);
  EXPECT_EQ(label->frame(), (Rect{155, 9.5, 50, 11}));
  EXPECT_EQ(button->frame(), (Rect{174, 23, 12, 12}));
}

// A button of no height takes the label's place and size: 50 x 11, inset (11 - 17) / 2 = -3 with a title of 17. Block 30.75;
// label y 6.5; button x as the label's, y 2.75 + 17.5 + 3 = 23.25, so 23.5.
TEST_F(DriveStatusLabelViewTest, AButtonOfNoHeightIsTakenToBeAsLargeAsTheLine) {
  button->takesNoRoom = true;
  view->setPrimaryLabelText("1234567890");
  view->showLowQuota(true);
  layOut(360, 46);
  EXPECT_EQ(label->frame(), (Rect{155, 6.5, 50, 11}));
  EXPECT_EQ(button->frame(), (Rect{155, 23.5, 50, 11}));
}

// (40 - 50) / 2 = -5: a line that does not fit is centred all the same.
TEST_F(DriveStatusLabelViewTest, ANarrowViewCentresWhatIsTooWide) {
  view->setPrimaryLabelText("1234567890");
  layOut(40, 46);
  EXPECT_EQ(label->frame().x, -5);
}

TEST_F(DriveStatusLabelViewTest, TheRoomThatItNeedsHoldsWhatItShows) {
  view->setPrimaryLabelText("1234567890");
  EXPECT_EQ(view->intrinsicContentSize(), (Size{50, 13}));
  view->showLowQuota(true);
  const Size needed = view->intrinsicContentSize();
  EXPECT_EQ(needed, (Size{50, 44.75}));
  layOut(needed.width, needed.height);
  EXPECT_GE(label->frame().y, 0);
  EXPECT_LE(button->frame().maxY(), needed.height);
}

TEST_F(DriveStatusLabelViewTest, HidingTheButtonAsksForLayout) {
  view->showLowQuota(true);
  layOut(360, 46);
  view->showLowQuota(false);
  EXPECT_TRUE(view->needsLayout());
}

// Half a point is no height: the title counts 11, as in a button without a title. The button is 12.5 high and 15.5 wide, its
// inset (12.5 - 11) / 2 = 0.75; block 24.75; label y 9.625, so 9.5; button y 2.75 + 20.5 - 0.75 = 22.5.
TEST_F(DriveStatusLabelViewTest, ATitleUnderAPointCountsAsHighAsTheLine) {
  button->titleLabel()->setFont(Font::preferred(TextStyle::Caption2).withSize(0.5));
  view->setPrimaryLabelText("1234567890");
  view->showLowQuota(true);
  layOut(360, 46);
  ASSERT_EQ(button->titleLabel()->frame().height, 0.5);
  EXPECT_EQ(label->frame().y, 9.5);
  EXPECT_EQ(button->frame().y, 22.5);
}

// As with no height at all: the label's 50 x 11 in place of 47 x 0.5.
TEST_F(DriveStatusLabelViewTest, AButtonUnderAPointIsTakenToBeAsLargeAsTheLine) {
  struct FlatButton : MemoryUpgradeButton {
    using MemoryUpgradeButton::MemoryUpgradeButton;
    Size intrinsicContentSize() const override { return {47, 0.5}; }
  };
  const auto flat = std::make_shared<FlatButton>(nullptr, false);
  flat->setTitle("Upgrade");
  view->setQuotaButton(flat);
  view->setPrimaryLabelText("1234567890");
  view->showLowQuota(true);
  layOut(360, 46);
  EXPECT_EQ(flat->frame(), (Rect{155, 23.5, 50, 11}));
}

}  // namespace
}  // namespace vaelo
