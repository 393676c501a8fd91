// SPDX-License-Identifier: GPL-3.0-or-later
// The frame of the application's own preview screens.
#include "items/launch_utils.h"
#include "tests/unit/preview_fixture.h"

namespace vaelo {
namespace {

using ::testing::ElementsAre;
using ::testing::IsEmpty;
using ::testing::SizeIs;

/// A screen whose button for the navigation bar a test chooses.
class BaseScreen : public PreviewBaseViewController {
 public:
  std::shared_ptr<Button> openInAppNavControllerButton() override { return openButton; }
  void updateProgress(const std::shared_ptr<Progress>&) override { ++updates; }
  void refreshItem() override {
    refreshes.push_back(barButtonActionItem() && (!navigationController() || parentTopConstraint()));
    PreviewBaseViewController::refreshItem();
  }
  std::shared_ptr<Button> openButton;
  std::vector<bool> refreshes;  ///< whether buttons and constraints were there already
  int updates = 0;
};

class PreviewBaseTest : public PreviewFixture {
 protected:
  PreviewBaseTest() {
    manager = makeManager(1);
    manager->setItemUpdatePreview(DRItem::initWithURL(document), false);
    screen->setItemManager(manager);
    screen->setMode(1);
  }
  void push() { nav->pushViewController(screen, false); }
  std::vector<std::optional<SystemItem>> kinds(const std::vector<BarButtonItemRef>& items) {
    std::vector<std::optional<SystemItem>> found;
    for (const BarButtonItemRef& item : items) found.push_back(item->systemItem());
    return found;
  }

  std::shared_ptr<PreviewItemManager> manager;
  std::shared_ptr<BaseScreen> screen = std::make_shared<BaseScreen>();
};

TEST_F(PreviewBaseTest, BuildsAScrollViewWithContentAndWrapper) {
  screen->view();
  const auto scroll = screen->scrollView();
  EXPECT_EQ(screen->view()->backgroundColor(), Color::white());
  EXPECT_THAT(screen->view()->subviews(), ElementsAre(scroll));
  EXPECT_THAT(scroll->subviews(), ElementsAre(screen->contentView()));
  EXPECT_THAT(screen->contentView()->subviews(), ElementsAre(screen->wrapperView()));
  EXPECT_EQ(screen->contentView()->debugName(), "ContentView");
  EXPECT_EQ(screen->contentView()->frame(), (Rect{0, 0, 375, 667}));
  EXPECT_TRUE(screen->contentView()->translatesAutoresizingMaskIntoConstraints());
  EXPECT_EQ(screen->wrapperView()->debugName(), "WrapperView");
  EXPECT_FALSE(screen->wrapperView()->translatesAutoresizingMaskIntoConstraints());
  EXPECT_FALSE(scroll->translatesAutoresizingMaskIntoConstraints());
  EXPECT_FALSE(scroll->showsHorizontalScrollIndicator());
  EXPECT_FALSE(scroll->showsVerticalScrollIndicator());
  EXPECT_TRUE(scroll->alwaysBounceVertical());
  EXPECT_FALSE(scroll->alwaysBounceHorizontal());
  EXPECT_TRUE(scroll->bounces());
  EXPECT_EQ(screen->lastProgressChunk(), -1);
}

TEST_F(PreviewBaseTest, ConstraintsComeWithANavigationController) {
  screen->viewWillAppear(false);
  EXPECT_EQ(screen->parentTopConstraint(), nullptr);
  push();
  for (const LayoutConstraintRef& edge : {screen->parentLeadingConstraint(), screen->parentTrailingConstraint(),
                                          screen->parentTopConstraint(), screen->parentBottomConstraint()}) {
    ASSERT_NE(edge, nullptr);
    EXPECT_TRUE(edge->active());
    EXPECT_EQ(edge->firstItem(), screen->wrapperView().get());
    EXPECT_EQ(edge->secondItem(), screen->contentView().get());
    EXPECT_EQ(edge->firstAttribute(), edge->secondAttribute());
  }
  EXPECT_EQ(screen->parentBottomConstraint()->firstAttribute(), LayoutAttribute::Bottom);
  EXPECT_THAT(screen->view()->constraints(), SizeIs(4)) << "the scroll view's four edges";
  screen->viewWillAppear(false);
  EXPECT_THAT(screen->view()->constraints(), SizeIs(4)) << "appearing again adds none";
}

TEST_F(PreviewBaseTest, EachAppearanceMakesTheButtonsAndConstraintsThenRefreshes) {
  push();
  EXPECT_THAT(screen->refreshes, ElementsAre(true));
  const auto button = screen->barButtonActionItem();
  const auto edge = screen->parentTopConstraint();
  screen->viewWillAppear(false);
  EXPECT_THAT(screen->refreshes, ElementsAre(true, true));
  EXPECT_NE(screen->barButtonActionItem(), button);
  EXPECT_NE(screen->parentTopConstraint(), edge);
  EXPECT_FALSE(edge->active());
}

TEST_F(PreviewBaseTest, OutsideANavigationControllerTheStatusBarAloneIsLeftFree) {
  memory.screens.deviceShown.statusBar = {0, 0, 360, 24};
  EXPECT_EQ(screen->scrollViewDefaultEdgeInsets(), (EdgeInsets{24, 0, 0, 0}));
  screen->view();
  screen->configureMargins();
  EXPECT_EQ(screen->parentBottomConstraint(), nullptr);
}

TEST_F(PreviewBaseTest, InsetsAreThoseOfTheBars) {
  push();
  memory.screens.deviceShown.statusBar = {0, 0, 360, 24};
  nav->setToolbarHidden(true);
  EXPECT_EQ(screen->scrollViewDefaultEdgeInsets(), (EdgeInsets{nav->navigationBarHeight() + 24, 0, 0, 0}));
  memory.screens.deviceShown.statusBar = {0, 0, 20, 720};
  nav->setToolbarHidden(false);
  EXPECT_EQ(screen->scrollViewDefaultEdgeInsets(),
            (EdgeInsets{nav->navigationBarHeight() + 20, 0, nav->toolbarHeight(), 0}));
}

TEST_F(PreviewBaseTest, TheContentFillsWhatTheBarsLeave) {
  push();
  const EdgeInsets insets = screen->scrollViewDefaultEdgeInsets();
  screen->view()->applyLayoutFrame({0, 0, 400, 900});
  const Rect expected = {0, 0, 400, 900 - insets.top - insets.bottom};
  EXPECT_EQ(screen->contentView()->frame(), expected);
  EXPECT_EQ(screen->scrollView()->contentSize(), expected.size());
  TraitCollection traits;
  traits.horizontalSizeClass = traits.verticalSizeClass = SizeClass::Regular;
  window->setTraitCollection(traits);
  memory.screens.deviceShown.orientation = InterfaceOrientation::Portrait;
  screen->view()->applyLayoutFrame({0, 0, 900, 901});
  EXPECT_EQ(screen->parentBottomConstraint()->constant(), -17);
  memory.screens.deviceShown.orientation = InterfaceOrientation::LandscapeRight;
  screen->view()->applyLayoutFrame({0, 0, 900, 400});
  EXPECT_EQ(screen->parentBottomConstraint()->constant(), 0) << "with each layout";
}

TEST_F(PreviewBaseTest, TheBottomMarginIsForPortrait) {
  TraitCollection traits;
  traits.horizontalSizeClass = SizeClass::Compact;
  traits.verticalSizeClass = SizeClass::Regular;
  window->setTraitCollection(traits);
  push();
  memory.screens.deviceShown.orientation = InterfaceOrientation::LandscapeLeft;
  EXPECT_EQ(screen->currentPseudoOrientation(), InterfaceOrientation::Portrait)
      << "narrow and high, whatever the device says";
  screen->setupConstraints();
  EXPECT_EQ(screen->parentBottomConstraint()->constant(), -17) << "from the beginning";
  screen->configureMargins();
  EXPECT_EQ(screen->parentBottomConstraint()->constant(), -17);
  traits.verticalSizeClass = SizeClass::Compact;
  window->setTraitCollection(traits);
  EXPECT_EQ(screen->currentPseudoOrientation(), InterfaceOrientation::LandscapeLeft) << "narrow alone is not enough";
  traits.verticalSizeClass = SizeClass::Regular;
  traits.horizontalSizeClass = SizeClass::Regular;
  window->setTraitCollection(traits);
  EXPECT_EQ(screen->currentPseudoOrientation(), InterfaceOrientation::LandscapeLeft);
  screen->configureMargins();
  EXPECT_EQ(screen->parentBottomConstraint()->constant(), 0);
  memory.screens.deviceShown.orientation = InterfaceOrientation::PortraitUpsideDown;
  screen->configureMargins();
  EXPECT_EQ(screen->parentBottomConstraint()->constant(), -17);
}

TEST_F(PreviewBaseTest, OnAPhoneTheButtonsAreInTheToolbar) {
  using enum SystemItem;
  nav->setToolbarHidden(true);
  push();
  EXPECT_THAT(kinds(screen->toolbarItems()), ElementsAre(Action, FlexibleSpace, Trash, FlexibleSpace, Organize));
  EXPECT_FALSE(nav->toolbarHidden());
  EXPECT_EQ(screen->toolbarItems().at(0), screen->barButtonActionItem());
  EXPECT_EQ(screen->toolbarItems().at(2), screen->barButtonDeleteItem());
  EXPECT_EQ(screen->toolbarItems().at(4), screen->barButtonMoveItem());
  EXPECT_THAT(screen->navigationItem().rightBarButtonItems(), IsEmpty());
}

TEST_F(PreviewBaseTest, OnATabletTheButtonsAreInTheBarAbove) {
  using enum SystemItem;
  makeTablet();
  screen->openButton = std::make_shared<Button>();
  push();
  EXPECT_THAT(kinds(screen->navigationItem().rightBarButtonItems()),
              ElementsAre(Action, FixedSpace, Trash, FixedSpace, Organize));
  EXPECT_TRUE(nav->toolbarHidden());
}

TEST_F(PreviewBaseTest, TheOpenButtonIsInTheBarOfDetailsOnAPhone) {
  screen->openButton = std::make_shared<Button>();
  screen->openButton->setTitle("Open");
  push();
  ASSERT_NE(screen->navigationItem().rightBarButtonItem(), nullptr);
  EXPECT_EQ(screen->navigationItem().rightBarButtonItem()->customView(), screen->openButton);
  EXPECT_GT(screen->openButton->frame().width, 0) << "sized to fit";
  const auto quick = std::make_shared<BaseScreen>();
  quick->setItemManager(manager);
  quick->openButton = std::make_shared<Button>();
  nav->pushViewController(quick, false);
  EXPECT_EQ(quick->navigationItem().rightBarButtonItem(), nullptr) << "mode 0";
  const auto other = std::make_shared<BaseScreen>();
  other->setItemManager(manager);
  other->setMode(2);
  other->openButton = std::make_shared<Button>();
  nav->pushViewController(other, false);
  EXPECT_EQ(other->navigationItem().rightBarButtonItem(), nullptr) << "mode 1 and no other";
}

TEST_F(PreviewBaseTest, TheOpenButtonOpensTheDocumentOnce) {
  const URL notes = addFile("Plans/Notes.txt");
  giveOwningApplication(notes);
  manager->setItemUpdatePreview(DRItem::initWithURL(notes), false);
  screen->openButton = std::make_shared<Button>();
  push();
  screen->viewWillAppear(false);
  screen->openButton->sendActions(ControlEvent::EditingChanged);
  EXPECT_EQ(times("INFO", "================= Pressed Open in <app>"), 0u);
  screen->openButton->sendActions(ControlEvent::TouchUpInside);
  EXPECT_EQ(times("INFO", "================= Pressed Open in <app>"), 1u) << "although it appeared twice";
  EXPECT_EQ(openingPresenter(), screen);
}

TEST_F(PreviewBaseTest, ButtonsAreEnabledForAnItemWithAPlace) {
  push();
  EXPECT_TRUE(screen->barButtonActionItem()->enabled());
  manager->setItemUpdatePreview(nullptr, false);
  screen->refreshItem();
  for (const BarButtonItemRef& button :
       {screen->barButtonActionItem(), screen->barButtonDeleteItem(), screen->barButtonMoveItem()}) {
    EXPECT_FALSE(button->enabled());
  }
  screen->configureButtons();
  for (const BarButtonItemRef& button :
       {screen->barButtonActionItem(), screen->barButtonDeleteItem(), screen->barButtonMoveItem()}) {
    EXPECT_FALSE(button->enabled()) << "new ones";
  }
  manager->setItemUpdatePreview(DRItem::initWithURL(document), false);
  screen->refreshItem();
  EXPECT_TRUE(screen->barButtonActionItem()->enabled());
  EXPECT_TRUE(screen->barButtonDeleteItem()->enabled());
  EXPECT_TRUE(screen->barButtonMoveItem()->enabled());
}

TEST_F(PreviewBaseTest, TheButtonsDoWhatTheySay) {
  push();
  screen->barButtonMoveItem()->press();
  EXPECT_TRUE(logged("INFO", "Pressed Move (itemMgr)"));
  nav->dismissViewControllerAnimated(false);
  screen->barButtonDeleteItem()->press();
  EXPECT_TRUE(logged("INFO", "================= Pressed Delete (preview base)"));
  ASSERT_NE(presentedAlert(), nullptr);
  EXPECT_EQ(presentedAlert()->popoverAnchor()->barButtonItem, screen->barButtonDeleteItem());
}

TEST_F(PreviewBaseTest, ShareShowsTheSheetAtItsButton) {
  push();
  screen->barButtonActionItem()->press();
  EXPECT_TRUE(logged("INFO", "================= Pressed Share (sheet) button (preview base)"));
  EXPECT_TRUE(logged("INFO", "showDocumentActivities: " + text(document)));
  ASSERT_THAT(memory.screens.interactions, SizeIs(1));
  const auto sheet = memory.screens.interactions.front();
  EXPECT_EQ(sheet->url(), document);
  EXPECT_EQ(sheet->fromButton, screen->barButtonActionItem());
  EXPECT_TRUE(sheet->wasAnimated);
  EXPECT_EQ(manager->documentInteractionController(), sheet);
  EXPECT_FALSE(loggedStarting("INFO", "URL resolved to "));
}

TEST_F(PreviewBaseTest, ShareOfABookmarkOfNothingShowsNoSheet) {
  push();
  const auto item = DRItem::initWithURL(document);
  item->setResolvedURL(addFile("Plans/Gone.vaelobookmark"));
  manager->setItemUpdatePreview(item, false);
  screen->showDocumentActivities();
  EXPECT_TRUE(logged("INFO", "URL resolved to (null)"));
  EXPECT_THAT(memory.screens.interactions, IsEmpty());
}

TEST_F(PreviewBaseTest, ShareOfABookmarkIsForItsDocument) {
  push();
  const URL outside = addOutsideFile("/home/user/Far.pdf");
  const URL bookmark = addFile("Plans/Far.vaelobookmark");
  memory.disk.items.at(bookmark.path()).bookmarkTarget = outside;
  const auto item = DRItem::initWithURL(document);
  item->setResolvedURL(bookmark);
  manager->setItemUpdatePreview(item, false);
  screen->showDocumentActivities();
  EXPECT_TRUE(logged("INFO", "URL resolved to " + text(outside)));
  EXPECT_EQ(memory.screens.interactions.back()->url(), outside);
}

TEST_F(PreviewBaseTest, ShareWithoutADocumentDoesNothing) {
  push();
  manager->setItemUpdatePreview(nullptr, false);
  screen->showDocumentActivities();
  const auto item = DRItem::initWithURL(document);
  item->setResolvedURL(std::nullopt);
  manager->setItemUpdatePreview(item, false);
  screen->showDocumentActivities();
  EXPECT_TRUE(logged("WARNING", "showDocumentActivities: url is wrong class: (null)"));
  EXPECT_FALSE(loggedStarting("INFO", "showDocumentActivities: "));
  screen->setItemManager({});
  screen->showDocumentActivities();
  EXPECT_THAT(memory.screens.interactions, IsEmpty());
}

TEST_F(PreviewBaseTest, ADocumentThatNothingOpensIsLogged) {
  push();
  screen->openInDefaultApp();
  EXPECT_TRUE(logged("INFO", "================= Pressed Open in <app>"));
  EXPECT_TRUE(logged("WARNING", "Failed to open document " + text(document) + " in default app"));
  log().clear();
  const URL text = addFile("Plans/Notes.txt");
  giveOwningApplication(text);
  manager->setItemUpdatePreview(DRItem::initWithURL(text), false);
  screen->openInDefaultApp();
  EXPECT_TRUE(logged("INFO", "Opening document " + text.absoluteString() + " in default app"));
  EXPECT_FALSE(loggedStarting("WARNING", "Failed to open document"));
  manager->setItemUpdatePreview(nullptr, false);
  screen->openInDefaultApp();
  EXPECT_TRUE(logged("WARNING", "Failed to open document (null) in default app"));
}

TEST_F(PreviewBaseTest, DisappearingEndsTheProgressAndTellsTheManager) {
  const auto shown = show(1);
  const auto details = shown->detailsViewController();
  details->registerForProgress();
  EXPECT_EQ(memory.fileProgress.subscriberCount(document), 1u);
  nav->popViewControllerAnimated(false);
  EXPECT_EQ(memory.fileProgress.subscriberCount(document), 0u);
  EXPECT_EQ(details->subscriber(), nullptr);
  EXPECT_EQ(shown->detailsViewController(), nullptr);
}

TEST_F(PreviewBaseTest, ProgressIsThatOfTheDocumentBehindTheItem) {
  const URL far = addFile("Plans/Far.pdf");
  const auto item = DRItem::initWithURL(document);
  item->setResolvedURL(far);
  manager->setItemUpdatePreview(item, false);
  screen->registerForProgress();
  EXPECT_EQ(memory.fileProgress.subscriberCount(far), 1u);
  EXPECT_EQ(memory.fileProgress.subscriberCount(document), 0u);
  screen->unregisterProgress();
  EXPECT_EQ(memory.fileProgress.subscriberCount(far), 0u);
}

TEST_F(PreviewBaseTest, ProgressIsToldInStepsOfFivePercent) {
  push();
  EXPECT_EQ(screen->subscriber(), nullptr) << "no screen asks by itself";
  screen->registerForProgress();
  ASSERT_NE(screen->subscriber(), nullptr);
  const auto progress = std::make_shared<MemoryProgress>();
  progress->setUnits(10, 1000);
  const auto withdraw = memory.fileProgress.publish(document, progress);
  EXPECT_TRUE(logged("DEBUG", "got progress progress 10/1000"));
  log().clear();
  const auto steps = [&](std::int64_t units, const char* level, const char* percent) {
    progress->setUnits(units, 1000);
    const std::string line = std::string("Progress ") + percent + "%: " + progress->description();
    EXPECT_TRUE(logged(level, line)) << line;
  };
  steps(0, "DEBUG", "0");
  steps(40, "DEBUG", "4");
  steps(50, "INFO", "5");
  steps(51, "DEBUG", "5.1");
  steps(999, "INFO", "99.9");
  steps(1000, "INFO", "100");
  EXPECT_EQ(screen->lastProgressChunk(), 20);
  EXPECT_EQ(screen->updates, 6);
  progress->tell("paused");
  screen->observeValueForKeyPathOfObjectChangeContext("paused", progress);
  EXPECT_EQ(screen->updates, 6) << "only the fraction counts";
  withdraw();
  EXPECT_EQ(screen->subscriber(), nullptr);
  EXPECT_EQ(progress->observerCount(), 0u);
  screen->refreshItem();
  EXPECT_EQ(screen->lastProgressChunk(), -1);
}

TEST_F(PreviewBaseTest, OtherProgressIsIgnoredButStaysObserved) {
  push();
  screen->registerForProgress();
  const auto other = std::make_shared<MemoryProgress>("other");
  memory.fileProgress.publish(document, other);
  EXPECT_TRUE(logged("DEBUG", "ignoring progress with different kind progress 0/0, kind = other"));
  const auto none = std::make_shared<MemoryProgress>();
  memory.fileProgress.publish(document, none);
  EXPECT_TRUE(logged("DEBUG", "ignoring progress with no progress done yet progress 0/0"));
  other->setUnits(1, 2);
  none->setUnits(1, 4);
  EXPECT_EQ(screen->updates, 2);
}

TEST_F(PreviewBaseTest, NewButtonsOfAnItemWithAPlaceAreEnabledAtOnce) {
  push();
  screen->configureButtons();
  for (const BarButtonItemRef& button :
       {screen->barButtonActionItem(), screen->barButtonDeleteItem(), screen->barButtonMoveItem()}) {
    EXPECT_TRUE(button->enabled());
  }
}

TEST_F(PreviewBaseTest, WithoutAPlaceThereIsNoProgressToFollow) {
  screen->setItemManager({});
  screen->registerForProgress();
  EXPECT_EQ(screen->subscriber(), nullptr);
  const auto item = DRItem::initWithURL(document);
  item->setResolvedURL(std::nullopt);
  manager->setItemUpdatePreview(item, false);
  screen->setItemManager(manager);
  screen->registerForProgress();
  EXPECT_EQ(screen->subscriber(), nullptr);
}

TEST_F(PreviewBaseTest, ProgressOfUnknownLengthIsNone) {
  push();
  screen->registerForProgress();
  const auto progress = std::make_shared<MemoryProgress>();
  memory.fileProgress.publish(document, progress);
  progress->setUnits(70, 0);
  EXPECT_TRUE(logged("DEBUG", "Progress 0%: " + progress->description()));
  EXPECT_EQ(screen->lastProgressChunk(), 0);
}

TEST_F(PreviewBaseTest, AProgressMayBeWithdrawnWhenTheScreenIsGone) {
  screen->registerForProgress();
  const auto progress = std::make_shared<MemoryProgress>();
  const auto withdraw = memory.fileProgress.publish(document, progress);
  screen = nullptr;
  progress->setUnits(1, 2);
  withdraw();
  EXPECT_FALSE(loggedStarting("INFO", "Progress "));
}

}  // namespace
}  // namespace vaelo
