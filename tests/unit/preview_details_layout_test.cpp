// SPDX-License-Identifier: GPL-3.0-or-later
// What the details' screen asks of the layout.
#include "platform/ui/keyboard_notice.h"
#include "preview/hairline_view.h"
#include "tests/unit/preview_fixture.h"

namespace vaelo {
namespace {

using enum LayoutAttribute;
using enum LayoutRelation;
using ::testing::Contains;
using ::testing::SizeIs;

/// A constraint as a value.
struct Asked {
  const View* first;
  LayoutAttribute attribute;
  LayoutRelation relation;
  const View* second;
  LayoutAttribute secondAttribute;
  double constant;
  friend bool operator==(const Asked&, const Asked&) = default;
};

std::vector<Asked> valuesOf(const std::vector<LayoutConstraintRef>& constraints) {
  std::vector<Asked> values;
  for (const LayoutConstraintRef& each : constraints) {
    values.push_back({each->firstItem(), each->firstAttribute(), each->relation(), each->secondItem(),
                      each->secondAttribute(), each->constant()});
  }
  return values;
}

class PreviewDetailsLayoutTest : public PreviewFixture {
 protected:
  void open() {
    manager = show(1);
    details = manager->detailsViewController();
  }
  static Asked equal(const ViewRef& first, const ViewRef& second, LayoutAttribute attribute, double constant = 0) {
    return {first.get(), attribute, Equal, second.get(), attribute, constant};
  }
  static std::vector<Asked> sides(const ViewRef& view, const ViewRef& around) {
    return {equal(view, around, Leading), equal(view, around, Trailing)};
  }

  std::shared_ptr<PreviewItemManager> manager;
  std::shared_ptr<PreviewDetailsViewController> details;
};

TEST_F(PreviewDetailsLayoutTest, TheThumbnailGrowsAndNeverShrinksBelowItsSize) {
  open();
  for (const LayoutAxis axis : {LayoutAxis::Horizontal, LayoutAxis::Vertical}) {
    EXPECT_EQ(details->thumbnailView()->contentHuggingPriority(axis), 249);
    EXPECT_EQ(details->thumbnailView()->contentCompressionResistancePriority(axis), 1000);
  }
}

TEST_F(PreviewDetailsLayoutTest, TheStacksFillTheWrapper) {
  open();
  const auto asked = valuesOf(details->wrapperView()->constraints());
  for (const LayoutAttribute edge : {Leading, Trailing, Top, Bottom}) {
    EXPECT_THAT(asked, Contains(equal(details->mainStackView(), details->wrapperView(), edge)));
  }
  EXPECT_EQ(details->fileDetailsView()->distribution(), StackDistribution::Fill);
  EXPECT_EQ(details->filenameStackView()->distribution(), StackDistribution::Fill);
}

TEST_F(PreviewDetailsLayoutTest, TheNameIsAsWideAsTheDetailsLessItsMarginsAndABitHigherThanItsLine) {
  open();
  const ViewRef field = details->filenameTextField();
  EXPECT_THAT(valuesOf(details->fileDetailsView()->constraints()),
              Contains(equal(field, details->fileDetailsView(), Width, -16)));
  // 24 points are 24 high here, and 24 * 1.3 = 31.2.
  const auto own = valuesOf(field->constraints());
  ASSERT_THAT(own, SizeIs(1));
  EXPECT_EQ(own[0].attribute, Height);
  EXPECT_DOUBLE_EQ(own[0].constant, 31.2);
}

TEST_F(PreviewDetailsLayoutTest, TheFactsAreCentredBetweenTheMargins) {
  open();
  const ViewRef facts = details->fileInfoView();
  const ViewRef around = details->fileDetailsView();
  const auto asked = valuesOf(around->constraints());
  EXPECT_THAT(asked, Contains(equal(facts, around, CenterX)));
  EXPECT_THAT(asked, Contains(Asked{facts.get(), Width, LessThanOrEqual, around.get(), Width, -16}));
}

TEST_F(PreviewDetailsLayoutTest, EachOrientationHasItsConstraints) {
  open();
  const ViewRef main = details->mainStackView();
  const ViewRef facts = details->fileDetailsView();
  const ViewRef picture = details->thumbnailView();
  std::vector<Asked> upright = sides(picture, main);
  for (const Asked& side : sides(facts, main)) upright.push_back(side);
  EXPECT_EQ(valuesOf(details->portraitConstraints()), upright);
  EXPECT_EQ(valuesOf(details->landscapeConstraints()),
            (std::vector<Asked>{equal(facts, main, CenterY),
                                {picture.get(), Height, LessThanOrEqual, main.get(), Height, 0},
                                equal(picture, facts, Height)}));
}

TEST_F(PreviewDetailsLayoutTest, BothWaysAcrossAreAcrossAndBothWaysUprightUpright) {
  open();
  for (const auto& [orientation, axis, alignment] :
       {std::tuple(InterfaceOrientation::LandscapeRight, LayoutAxis::Horizontal, StackAlignment::Leading),
        std::tuple(InterfaceOrientation::Portrait, LayoutAxis::Vertical, StackAlignment::Center),
        std::tuple(InterfaceOrientation::LandscapeLeft, LayoutAxis::Horizontal, StackAlignment::Leading),
        std::tuple(InterfaceOrientation::PortraitUpsideDown, LayoutAxis::Vertical, StackAlignment::Center)}) {
    details->adjustViewsForOrientation(orientation);
    EXPECT_EQ(details->mainStackView()->axis(), axis);
    EXPECT_EQ(details->fileDetailsView()->alignment(), alignment);
    EXPECT_EQ(details->filenameStackView()->alignment(), alignment);
  }
}

TEST_F(PreviewDetailsLayoutTest, ItIsFirstLaidOutAsTheDeviceIsHeld) {
  TraitCollection traits;
  traits.horizontalSizeClass = traits.verticalSizeClass = SizeClass::Regular;
  window->setTraitCollection(traits);
  memory.screens.deviceShown.orientation = InterfaceOrientation::LandscapeLeft;
  manager = makeManager(1);
  manager->previewItem(DRItem::initWithURL(document));
  details = manager->detailsViewController();
  EXPECT_EQ(details->currentPseudoOrientation(), InterfaceOrientation::LandscapeLeft);
  EXPECT_EQ(details->mainStackView()->axis(), LayoutAxis::Horizontal);
}

TEST_F(PreviewDetailsLayoutTest, TheButtonBelowTheFactsLooksLikeTheName) {
  const URL text = addFile("Plans/Notes.txt");
  giveOwningApplication(text);
  makeTablet();
  manager = makeManager(1);
  manager->previewItem(DRItem::initWithURL(text));
  details = manager->detailsViewController();
  const auto& parts = details->fileDetailsView()->arrangedSubviews();
  ASSERT_THAT(parts, SizeIs(4));
  EXPECT_NE(std::dynamic_pointer_cast<HairlineView>(parts[2]), nullptr);
  Button& button = *details->openInAppButton();
  EXPECT_EQ(button.type(), ButtonType::System);
  EXPECT_EQ(button.titleLabel()->font(), Font::preferred(TextStyle::Title2).withSize(24));
  EXPECT_EQ(button.contentCompressionResistancePriority(LayoutAxis::Horizontal), 1000);
  EXPECT_EQ(button.contentCompressionResistancePriority(LayoutAxis::Vertical), 1000);
}

TEST_F(PreviewDetailsLayoutTest, LinesGoFromSideToSide) {
  const URL text = addFile("Plans/Notes.txt");
  giveOwningApplication(text);
  makeTablet();
  manager = makeManager(1);
  manager->previewItem(DRItem::initWithURL(text));
  details = manager->detailsViewController();
  const auto& name = details->filenameStackView()->arrangedSubviews();
  const auto& facts = details->fileDetailsView()->arrangedSubviews();
  ASSERT_THAT(name, SizeIs(3));
  ASSERT_THAT(facts, SizeIs(4));
  for (const auto& [line, stack] :
       {std::pair(name[0], details->filenameStackView()), std::pair(name[2], details->filenameStackView()),
        std::pair(facts[2], details->fileDetailsView())}) {
    for (const Asked& side : sides(line, stack)) EXPECT_THAT(valuesOf(stack->constraints()), Contains(side));
  }
}

TEST_F(PreviewDetailsLayoutTest, SideBySideNeitherIsHigherThanItNeedsToBe) {
  open();
  for (const auto orientation : {InterfaceOrientation::LandscapeRight, InterfaceOrientation::Portrait}) {
    details->adjustViewsForOrientation(orientation);
    EXPECT_EQ(details->mainStackView()->alignment(), StackAlignment::Center);
  }
}

// Content from 40 to 640; the stack within it, 25 + 35 further down and 500 high, ends at 40 + 25 + 35 + 500 = 600: 40
// points below it are empty. 250 - 40 + 30.
TEST_F(PreviewDetailsLayoutTest, TheEmptySpaceBelowTheStackIsMeasuredInTheScrollView) {
  open();
  details->contentView()->setFrame({0, 40, 360, 600});
  details->wrapperView()->setFrame({0, 25, 360, 560});
  details->mainStackView()->setFrame({0, 35, 360, 500});
  KeyboardNotice notice;
  notice.beginFrame = {0, 720, 360, 250};
  memory.notifications.post({KeyboardWillShowNotification, notice.userInfo()});
  EXPECT_EQ(details->scrollView()->contentInset().bottom, 240);
}

}  // namespace
}  // namespace vaelo
