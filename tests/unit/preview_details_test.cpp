// SPDX-License-Identifier: GPL-3.0-or-later
// The details' screen: its layout, its refresh, and the name that is changed in its place.
#include "platform/ui/keyboard_notice.h"
#include "preview/hairline_view.h"
#include "tests/unit/preview_fixture.h"

namespace vaelo {
namespace {

using ::testing::ElementsAre;
using ::testing::IsEmpty;
using ::testing::SizeIs;

/// Keeps how the screen was animated.
struct Animations : ViewObserver {
  void viewChanged(View&, ViewChange) override {}
  void animationWillBegin(View&, const Animation& animation) override { begun.push_back(animation); }
  void animationDidEnd(View&) override {}
  void viewWillBeDestroyed(View&) override {}
  std::vector<Animation> begun;
};

class PreviewDetailsTest : public PreviewFixture {
 protected:
  /// Shows the details of the document.
  PreviewDetailsViewController& open() {
    manager = show(1);
    details = manager->detailsViewController();
    return *details;
  }
  TextField& field() { return *details->filenameTextField(); }
  bool begin() { return field().becomeFirstResponder(); }
  URL named(const char* name) { return document.deletingLastPathComponent().appendingPathComponent(name); }
  bool isThere(const URL& url) { return memory.disk.logicalItem(url.path()) != nullptr; }

  std::shared_ptr<PreviewItemManager> manager;
  std::shared_ptr<PreviewDetailsViewController> details;
};

TEST_F(PreviewDetailsTest, TheScreenIsBuiltOfStacks) {
  open();
  EXPECT_EQ(details->mainStackView()->debugName(), "MainStackView");
  EXPECT_THAT(details->mainStackView()->arrangedSubviews(),
              ElementsAre(details->thumbnailView(), details->fileDetailsView()));
  EXPECT_EQ(details->mainStackView()->spacing(), 0);
  EXPECT_EQ(details->mainStackView()->superview(), details->wrapperView().get());
  EXPECT_EQ(details->filenameStackView()->debugName(), "FilenameStackView");
  EXPECT_EQ(details->filenameStackView()->spacing(), 7);
  const auto& name = details->filenameStackView()->arrangedSubviews();
  ASSERT_THAT(name, SizeIs(3));
  EXPECT_NE(std::dynamic_pointer_cast<HairlineView>(name[0]), nullptr);
  EXPECT_EQ(name[1], details->filenameTextField());
  EXPECT_NE(std::dynamic_pointer_cast<HairlineView>(name[2]), nullptr);
  EXPECT_EQ(details->fileDetailsView()->debugName(), "FileDetailsView");
  EXPECT_EQ(details->fileDetailsView()->spacing(), 15);
  EXPECT_EQ(details->fileDetailsView()->contentHuggingPriority(LayoutAxis::Vertical), 1000);
  EXPECT_THAT(details->fileDetailsView()->arrangedSubviews(),
              ElementsAre(details->filenameStackView(), details->fileInfoView()));
  EXPECT_EQ(details->fileInfoView()->axis(), LayoutAxis::Vertical);
  EXPECT_EQ(details->thumbnailView()->contentHuggingPriority(LayoutAxis::Vertical), 249);
  EXPECT_EQ(details->thumbnailView()->contentCompressionResistancePriority(LayoutAxis::Horizontal), 1000);
  EXPECT_EQ(details->filenameTextFieldFullWidthConstraint()->constant(), -16);
}

TEST_F(PreviewDetailsTest, TheFieldTakesOneName) {
  open();
  EXPECT_EQ(field().returnKeyType(), ReturnKeyType::Done);
  EXPECT_TRUE(field().enablesReturnKeyAutomatically());
  EXPECT_EQ(field().autocapitalizationType(), AutocapitalizationType::Words);
  EXPECT_EQ(field().autocorrectionType(), AutocorrectionType::No);
  EXPECT_EQ(field().clearButtonMode(), ClearButtonMode::WhileEditing);
  EXPECT_EQ(field().font(), Font::preferred(TextStyle::Title2).withSize(24));
  EXPECT_EQ(field().delegate(), details);
  EXPECT_FALSE(details->textFieldShouldScrollToVisibleWhenBecomingFirstResponder(field()));
}

TEST_F(PreviewDetailsTest, UprightThingsAreStackedAndAcrossTheyAreSideBySide) {
  open();
  details->adjustViewsForOrientation(InterfaceOrientation::LandscapeLeft);
  EXPECT_EQ(details->mainStackView()->axis(), LayoutAxis::Horizontal);
  EXPECT_EQ(details->mainStackView()->distribution(), StackDistribution::FillEqually);
  EXPECT_EQ(details->fileDetailsView()->alignment(), StackAlignment::Leading);
  EXPECT_EQ(details->filenameStackView()->alignment(), StackAlignment::Leading);
  EXPECT_EQ(field().textAlignment(), TextAlignment::Natural);
  for (const auto& constraint : details->portraitConstraints()) EXPECT_FALSE(constraint->active());
  ASSERT_THAT(details->landscapeConstraints(), SizeIs(3));
  for (const auto& constraint : details->landscapeConstraints()) EXPECT_TRUE(constraint->active());
  details->adjustViewsForOrientation(InterfaceOrientation::PortraitUpsideDown);
  EXPECT_EQ(details->mainStackView()->axis(), LayoutAxis::Vertical);
  EXPECT_EQ(details->mainStackView()->distribution(), StackDistribution::Fill);
  EXPECT_EQ(details->fileDetailsView()->alignment(), StackAlignment::Center);
  EXPECT_EQ(field().textAlignment(), TextAlignment::Center);
  ASSERT_THAT(details->portraitConstraints(), SizeIs(4));
  for (const auto& constraint : details->portraitConstraints()) EXPECT_TRUE(constraint->active());
  for (const auto& constraint : details->landscapeConstraints()) EXPECT_FALSE(constraint->active());
}

TEST_F(PreviewDetailsTest, ASizeThatIsWiderThanHighTurnsTheScreen) {
  open();
  TransitionCoordinator coordinator;
  details->viewWillTransitionToSize({800, 400}, coordinator);
  EXPECT_EQ(details->mainStackView()->axis(), LayoutAxis::Horizontal);
  field().setText("typed");
  details->viewWillTransitionToSize({400, 400}, coordinator);
  EXPECT_EQ(details->mainStackView()->axis(), LayoutAxis::Vertical);
  EXPECT_EQ(field().text(), *manager->item()->localizedName()) << "refreshed";
}

TEST_F(PreviewDetailsTest, AnotherSizeMeasuresTheDetailsAgain) {
  open();
  struct : Animations {
    void viewChanged(View&, ViewChange change) override { changes.push_back(change); }
    std::vector<ViewChange> changes;
  } seen;
  details->fileDetailsView()->setObserver(&seen);
  TransitionCoordinator coordinator;
  details->viewWillTransitionToSize({400, 500}, coordinator);
  EXPECT_THAT(seen.changes, ::testing::Contains(ViewChange::Constraints));
  details->fileDetailsView()->setObserver(nullptr);
}

TEST_F(PreviewDetailsTest, AnotherOrientationHasOtherMargins) {
  TraitCollection traits;
  traits.horizontalSizeClass = traits.verticalSizeClass = SizeClass::Regular;
  window->setTraitCollection(traits);
  open();
  EXPECT_EQ(details->parentBottomConstraint()->constant(), -17);
  memory.screens.deviceShown.orientation = InterfaceOrientation::LandscapeRight;
  TransitionCoordinator coordinator;
  details->viewWillTransitionToSize({1280, 800}, coordinator);
  EXPECT_EQ(details->parentBottomConstraint()->constant(), 0);
}

TEST_F(PreviewDetailsTest, RefreshShowsTheItem) {
  open();
  const std::string name = *manager->item()->localizedName();
  EXPECT_EQ(details->originalFilename(), name);
  EXPECT_EQ(field().text(), name);
  EXPECT_EQ(details->fileInfoView()->item(), manager->item());
  EXPECT_EQ(details->thumbnailView()->item(), manager->item());
  manager->item()->setHasHiddenExtension(false);
  details->refreshItem();
  EXPECT_EQ(details->originalSuffix(), "pdf");
  manager->item()->setHasHiddenExtension(true);
  details->refreshItem();
  EXPECT_EQ(details->originalSuffix(), std::nullopt);
  field().setPlaceholder("name");
  EXPECT_TRUE(details->toolbarItems().at(0)->enabled());
  manager->setItemUpdatePreview(nullptr, false);
  details->refreshItem();
  EXPECT_EQ(details->originalFilename(), std::nullopt);
  EXPECT_EQ(field().text(), "");
  EXPECT_EQ(field().placeholder(), "");
  EXPECT_FALSE(details->toolbarItems().at(0)->enabled()) << "there is nothing to act on";
}

TEST_F(PreviewDetailsTest, TheDefaultApplicationHasAButton) {
  const URL text = addFile("Plans/Notes.txt");
  giveOwningApplication(text);
  memory.launch.rankedByPath.at(text.path()).value->at(0).second.at(0).localizedName = "Writer";
  const auto shown = [&] {
    manager = makeManager(1);
    manager->previewItem(DRItem::initWithURL(text));
    details = manager->detailsViewController();
  };
  shown();
  ASSERT_NE(details->openInAppButton(), nullptr);
  EXPECT_EQ(details->openInAppButton()->title(), "Open in “Writer”");
  EXPECT_FALSE(details->shouldDisplayOpenInAppButtonInView());
  EXPECT_EQ(details->openInAppNavControllerButton(), details->openInAppButton());
  EXPECT_EQ(details->navigationItem().rightBarButtonItem()->customView(), details->openInAppButton());
  makeTablet();
  shown();
  EXPECT_TRUE(details->shouldDisplayOpenInAppButtonInView());
  EXPECT_EQ(details->openInAppNavControllerButton(), nullptr);
  ASSERT_THAT(details->fileDetailsView()->arrangedSubviews(), SizeIs(4));
  EXPECT_EQ(details->fileDetailsView()->arrangedSubviews()[3], details->openInAppButton());
  details->openInAppButton()->sendActions(ControlEvent::TouchUpInside);
  EXPECT_TRUE(logged("INFO", "================= Pressed Open in <app>"));
}

TEST_F(PreviewDetailsTest, AnApplicationThatOpensNothingInPlaceHasNoButton) {
  const URL text = addFile("Plans/Notes.txt");
  giveOwningApplication(text);
  memory.launch.rankedByPath.at(text.path()).value->at(0).second.at(0).supportsOpenInPlace = false;
  manager = makeManager(1);
  manager->previewItem(DRItem::initWithURL(text));
  EXPECT_EQ(manager->detailsViewController()->openInAppButton(), nullptr);
}

TEST_F(PreviewDetailsTest, WithoutAnApplicationThereIsNoButton) {
  open();
  EXPECT_EQ(details->openInAppButton(), nullptr);
  EXPECT_EQ(details->openInAppNavControllerButton(), nullptr);
}

TEST_F(PreviewDetailsTest, EditingBeginsBeforeTheExtensionAndTurnsTheBar) {
  open();
  manager->item()->setHasHiddenExtension(false);
  ASSERT_TRUE(begin());
  EXPECT_TRUE(logged("DEBUG", "ShouldBeginEditing: 1"));
  EXPECT_TRUE(logged("DEBUG", "DidBeginEditing 'Report.pdf' = 'Report.pdf'"));
  EXPECT_EQ(field().selectedRange(), (TextRange{6, 0}));
  EXPECT_EQ(details->filenameTextFieldFullWidthConstraint()->constant(), 0);
  NavigationItem& bar = details->navigationItem();
  EXPECT_EQ(bar.title(), "Rename File");
  EXPECT_TRUE(bar.hidesBackButton());
  EXPECT_TRUE(bar.leftItemsSupplementBackButton());
  EXPECT_EQ(bar.leftBarButtonItem()->systemItem(), SystemItem::Cancel);
  ASSERT_THAT(bar.rightBarButtonItems(), SizeIs(1));
  EXPECT_EQ(bar.rightBarButtonItem()->systemItem(), SystemItem::Done);
}

TEST_F(PreviewDetailsTest, TheCaretIsSetBeforeTheBarTurns) {
  open();
  struct : Animations {
    void viewChanged(View&, ViewChange change) override {
      if (change == ViewChange::Selection) titles.push_back(bar->title());
    }
    const NavigationItem* bar = nullptr;
    std::vector<std::string> titles;
  } seen;
  seen.bar = &details->navigationItem();
  field().setObserver(&seen);
  begin();
  field().setObserver(nullptr);
  EXPECT_THAT(seen.titles, ElementsAre(""));
}

TEST_F(PreviewDetailsTest, TheLogTellsTheNameThatIsKeptAndTheItems) {
  open();
  manager->item()->setLocalizedName("Other.pdf");
  begin();
  EXPECT_TRUE(logged("DEBUG", "DidBeginEditing 'Report.pdf' = 'Other.pdf'"));
}

TEST_F(PreviewDetailsTest, AHiddenExtensionLeavesTheCaret) {
  open();
  manager->item()->setHasHiddenExtension(true);
  field().setSelectedRange({2, 0});
  begin();
  EXPECT_EQ(field().selectedRange(), (TextRange{2, 0}));
}

TEST_F(PreviewDetailsTest, WhatCannotBeRenamedIsNotEdited) {
  open();
  manager->item()->setRenameable(false);
  EXPECT_FALSE(begin());
  EXPECT_TRUE(logged("DEBUG", "ShouldBeginEditing: 0"));
  EXPECT_EQ(details->navigationItem().title(), "");
}

TEST_F(PreviewDetailsTest, ReturnRenamesOnceAndRestoresTheBar) {
  makeTablet();
  open();
  const auto right = details->navigationItem().rightBarButtonItems();
  begin();
  field().userSetText("Plan.pdf");
  EXPECT_TRUE(field().pressReturn());
  EXPECT_FALSE(field().isEditing());
  EXPECT_TRUE(logged("DEBUG", "textFieldShouldReturn"));
  EXPECT_TRUE(logged("DEBUG", "ShouldEndEditing: old:'Report.pdf', new:'Plan.pdf'"));
  EXPECT_TRUE(logged("DEBUG", "DidEndEditing: old:'Plan.pdf', new:'Plan.pdf'"));
  EXPECT_TRUE(isThere(named("Plan.pdf")));
  EXPECT_EQ(details->originalFilename(), "Plan.pdf");
  EXPECT_EQ(details->filenameTextFieldFullWidthConstraint()->constant(), -16);
  NavigationItem& bar = details->navigationItem();
  EXPECT_EQ(bar.title(), "");
  EXPECT_FALSE(bar.hidesBackButton());
  EXPECT_FALSE(bar.leftItemsSupplementBackButton());
  EXPECT_THAT(bar.leftBarButtonItems(), IsEmpty());
  EXPECT_EQ(bar.rightBarButtonItems(), right);
}

TEST_F(PreviewDetailsTest, TheSameNameRenamesNothing) {
  open();
  begin();
  log().clear();
  field().pressReturn();
  EXPECT_FALSE(loggedStarting("DEBUG", "Name is valid"));
  EXPECT_TRUE(isThere(document));
}

TEST_F(PreviewDetailsTest, AnEmptyNameIsTakenBackByATap) {
  open();
  begin();
  field().userSetText("");
  details->view()->gestureRecognizers().at(0)->recognize();
  EXPECT_FALSE(field().isEditing());
  EXPECT_EQ(field().text(), "Report.pdf");
  EXPECT_TRUE(isThere(document));
}

TEST_F(PreviewDetailsTest, CancelTakesTheNameBackFirst) {
  open();
  begin();
  field().userSetText("Plan.pdf");
  details->navigationItem().leftBarButtonItem()->press();
  EXPECT_FALSE(field().isEditing());
  EXPECT_EQ(field().text(), "Report.pdf");
  EXPECT_TRUE(isThere(document));
}

TEST_F(PreviewDetailsTest, DoneInTheBarRenames) {
  open();
  begin();
  field().userSetText("Plan.pdf");
  details->navigationItem().rightBarButtonItem()->press();
  EXPECT_TRUE(isThere(named("Plan.pdf")));
}

TEST_F(PreviewDetailsTest, ARefusedNameStaysInTheField) {
  addFile("Plans/Taken.pdf");
  open();
  begin();
  field().userSetText("Taken.pdf");
  EXPECT_FALSE(field().resignFirstResponder());
  EXPECT_TRUE(field().isEditing());
  EXPECT_EQ(field().text(), "Taken.pdf");
  ASSERT_NE(presentedAlert(), nullptr);
  EXPECT_EQ(presentedAlert()->title(), "The name “Taken” with extension “.pdf” is already taken.");
  EXPECT_EQ(presentedAlert()->message(), "Choose a different name.");
  log().clear();
  EXPECT_TRUE(field().resignFirstResponder()) << "behind the alert the end is allowed";
  EXPECT_FALSE(loggedStarting("DEBUG", "Name is valid")) << "and not tried again";
}

TEST_F(PreviewDetailsTest, BehindAnAlertTheEditingEndsAsItIs) {
  open();
  begin();
  field().userSetText("");
  presentSomething();
  EXPECT_TRUE(field().resignFirstResponder());
  EXPECT_EQ(field().text(), "") << "not even an empty name is taken back";
}

TEST_F(PreviewDetailsTest, EachRenameKeepsTheButtonsOfItsTime) {
  open();
  const auto now = [](const char* title) {
    return std::vector{BarButtonItem::withTitle(title, BarButtonStyle::Plain, nullptr)};
  };
  for (const char* title : {"first", "second"}) {
    const auto right = now(title);
    details->navigationItem().setRightBarButtonItems(right);
    details->updateNavBarForRename(true);
    EXPECT_EQ(details->originalRightBarButtonItems(), right);
    details->updateNavBarForRename(false);
    EXPECT_EQ(details->navigationItem().rightBarButtonItems(), right);
  }
}

TEST_F(PreviewDetailsTest, TheButtonsOfARenameGoBeforeTheOthersComeBack) {
  open();
  const std::vector right{BarButtonItem::withTitle("Open", BarButtonStyle::Plain, nullptr)};
  NavigationItem& bar = details->navigationItem();
  bar.setRightBarButtonItems(right);
  details->updateNavBarForRename(true);
  bool wentFirst = false;
  const auto token =
      bar.changed().connect([&](NavigationItem& changed) { wentFirst |= changed.rightBarButtonItems().empty(); });
  details->updateNavBarForRename(false);
  EXPECT_TRUE(wentFirst);
  EXPECT_EQ(bar.rightBarButtonItems(), right);
}

TEST_F(PreviewDetailsTest, DoneEndsTheEditingEvenOfARefusedName) {
  addFile("Plans/Taken.pdf");
  open();
  begin();
  field().userSetText("Taken.pdf");
  details->navigationItem().rightBarButtonItem()->press();
  EXPECT_FALSE(field().isEditing());
  ASSERT_NE(presentedAlert(), nullptr) << "what went wrong is told";
  EXPECT_EQ(details->originalFilename(), "Report.pdf");
  EXPECT_TRUE(isThere(document));
}

TEST_F(PreviewDetailsTest, ARefreshInTheMiddleOfAnEditShowsTheCurrentName) {
  open();
  begin();
  field().userSetText("Plan.pdf");
  details->refreshItem();
  EXPECT_TRUE(field().isEditing());
  EXPECT_EQ(field().text(), "Report.pdf");
}

TEST_F(PreviewDetailsTest, ATapOnTheScreenAtRestChangesNothing) {
  open();
  EXPECT_TRUE(details->view()->userInteractionEnabled());
  log().clear();
  details->view()->gestureRecognizers().at(0)->recognize();
  EXPECT_FALSE(loggedStarting("DEBUG", "ShouldEndEditing"));
  EXPECT_TRUE(isThere(document));
}

TEST_F(PreviewDetailsTest, ANameThatWasRestoredRenamesNothingLater) {
  open();
  begin();
  field().userSetText("");
  EXPECT_TRUE(field().resignFirstResponder());
  EXPECT_EQ(field().text(), "Report.pdf");
  EXPECT_EQ(details->originalFilename(), "Report.pdf");
  log().clear();
  begin();
  field().pressReturn();
  EXPECT_FALSE(loggedStarting("DEBUG", "Name is valid"));
}

TEST_F(PreviewDetailsTest, ANewlineEndsTheEditingAndIsNotTyped) {
  open();
  begin();
  EXPECT_FALSE(field().userReplace({0, 0}, "\n"));
  EXPECT_FALSE(field().isEditing());
  begin();
  EXPECT_TRUE(field().userReplace({0, 0}, "x\n"));
}

TEST_F(PreviewDetailsTest, LeavingKeepsTheTypedTextAndEndsTheKeyboardsNotices) {
  open();
  field().setText("typed");
  nav->popViewControllerAnimated(false);
  EXPECT_EQ(details->originalFilename(), "typed");
  details->scrollView()->setContentInset({1, 2, 3, 4});
  memory.notifications.post({KeyboardWillHideNotification, {}});
  EXPECT_EQ(details->scrollView()->contentInset(), (EdgeInsets{1, 2, 3, 4}));
}

TEST_F(PreviewDetailsTest, TheScreenMovesWithTheKeyboard) {
  open();
  Animations animations;
  details->view()->setObserver(&animations);
  KeyboardNotice notice;
  notice.seconds = 0.4;
  notice.curve = AnimationCurve::EaseOut;
  for (const char* name : {KeyboardWillShowNotification, KeyboardWillHideNotification}) {
    animations.begun.clear();
    memory.notifications.post({name, notice.userInfo()});
    ASSERT_THAT(animations.begun, SizeIs(1));
    EXPECT_EQ(animations.begun[0].seconds, 0.4);
    EXPECT_EQ(animations.begun[0].curve, AnimationCurve::EaseOut);
    EXPECT_TRUE(animations.begun[0].layoutSubviews);
    EXPECT_TRUE(animations.begun[0].beginFromCurrentState);
  }
  details->view()->setObserver(nullptr);
}

TEST_F(PreviewDetailsTest, WhatIsHigherThanTheScreenLeavesNoRoomToTheKeyboard) {
  open();
  ScrollView& scroll = *details->scrollView();
  scroll.setFrame({0, 0, 360, 600});
  scroll.setContentSize({360, 100});
  scroll.setContentInset({10, 1, 2, 3});
  details->contentView()->setFrame({0, 0, 360, 600});
  details->wrapperView()->setFrame({0, 0, 360, 600});
  details->mainStackView()->setFrame({0, 0, 360, 700});
  details->fileDetailsView()->setFrame({0, 300, 360, 400});
  details->filenameStackView()->setFrame({0, 20, 360, 60});
  field().setFrame({8, 7, 344, 46});
  KeyboardNotice notice;
  notice.beginFrame = {0, 720, 360, 250};
  notice.endFrame = {0, 470, 360, 260};
  memory.notifications.post({KeyboardWillShowNotification, notice.userInfo()});
  EXPECT_EQ(scroll.contentInset().bottom, 280) << "250 - 0 + 30";
  EXPECT_EQ(scroll.contentOffset(), (Point{0, 0})) << "100 - 600 + 280 is above the top";
  scroll.setContentSize({360, 900});
  memory.notifications.post({KeyboardWillShowNotification, notice.userInfo()});
  EXPECT_EQ(scroll.contentOffset(), (Point{0, 287})) << "327 - 10 - 30; as far as 580 would do";
  details->fileDetailsView()->setFrame({0, 0, 360, 400});
  memory.notifications.post({KeyboardWillShowNotification, notice.userInfo()});
  EXPECT_EQ(scroll.contentOffset(), (Point{0, 0})) << "27 - 10 - 30 is above the top";
}

TEST_F(PreviewDetailsTest, TheKeyboardMakesRoomForTheField) {
  open();
  ScrollView& scroll = *details->scrollView();
  scroll.setFrame({0, 0, 360, 600});
  scroll.setContentSize({360, 600});
  scroll.setContentInset({10, 1, 2, 3});
  details->contentView()->setFrame({0, 0, 360, 600});
  details->wrapperView()->setFrame({0, 0, 360, 600});
  details->mainStackView()->setFrame({0, 0, 360, 560});
  details->fileDetailsView()->setFrame({0, 300, 360, 260});
  details->filenameStackView()->setFrame({0, 20, 360, 60});
  field().setFrame({8, 7, 344, 46});
  KeyboardNotice notice;
  notice.beginFrame = {0, 720, 360, 250};
  memory.notifications.post({KeyboardWillShowNotification, notice.userInfo()});
  // 40 points are empty below the stack: 250 - 40 + 30
  EXPECT_EQ(scroll.contentInset(), (EdgeInsets{10, 1, 240, 3}));
  // the field's top is at 327: 327 - 10 - 30 = 287, and no further than 600 - 600 + 240
  EXPECT_EQ(scroll.contentOffset(), (Point{0, 240}));
  details->fileDetailsView()->setFrame({0, 100, 360, 260});
  memory.notifications.post({KeyboardWillShowNotification, notice.userInfo()});
  EXPECT_EQ(scroll.contentOffset(), (Point{0, 87}));
  memory.notifications.post({KeyboardWillHideNotification, notice.userInfo()});
  EXPECT_EQ(scroll.contentInset(), details->scrollViewDefaultEdgeInsets());
}

}  // namespace
}  // namespace vaelo
