// SPDX-License-Identifier: GPL-3.0-or-later
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <algorithm>

#include "platform/ui/alert_controller.h"
#include "platform/ui/document_list_controller.h"
#include "platform/ui/document_target_selection_controller.h"
#include "platform/ui/navigation_controller.h"
#include "platform/ui/preview_controller.h"
#include "platform/ui/search_controller.h"
#include "platform/ui/window.h"

namespace vaelo {
namespace {

using testing::ElementsAre;
using Log = std::vector<std::string>;

class LoggingScreen : public ViewController {
 public:
  LoggingScreen(std::string name, Log& log) : name_(std::move(name)), log_(log) {}
  void viewDidLoad() override { log_.push_back(name_ + " load"); }
  void viewWillAppear(bool) override { log_.push_back(name_ + " will appear"); }
  void viewDidAppear(bool) override { log_.push_back(name_ + " did appear"); }
  void viewWillDisappear(bool) override { log_.push_back(name_ + " will disappear"); }
  void viewDidDisappear(bool) override { log_.push_back(name_ + " did disappear"); }
  void viewWillTransitionToSize(const Size& size, TransitionCoordinator& coordinator) override {
    ViewController::viewWillTransitionToSize(size, coordinator);
    log_.push_back(name_ + " to width " + std::to_string(static_cast<int>(size.width)));
  }

 private:
  std::string name_;
  Log& log_;
};

class NavigationLog : public NavigationControllerDelegate {
 public:
  explicit NavigationLog(Log& log) : log_(log) {}
  void navigationControllerWillShowViewControllerAnimated(NavigationController&, const ViewControllerRef& screen,
                                                          bool) override {
    log_.push_back("will show " + screen->title());
  }
  void navigationControllerDidShowViewControllerAnimated(NavigationController&, const ViewControllerRef& screen,
                                                         bool) override {
    log_.push_back("did show " + screen->title());
  }

 private:
  Log& log_;
};

/// Keeps what it is asked until the test lets it finish.
class SlowHost : public NavigationHost, public PresentationHost {
 public:
  void stackChanged(const Stack&, const Stack&, bool, std::function<void()> done) override { push(std::move(done)); }
  void toolbarHiddenChanged(bool hidden, bool) override { toolbarHidden = hidden; }
  void present(const ViewControllerRef&, const ViewControllerRef&, bool, std::function<void()> done) override {
    push(std::move(done));
  }
  void dismiss(const ViewControllerRef&, bool, std::function<void()> done) override { push(std::move(done)); }
  void finish() {
    const auto running = std::exchange(pending, {});
    for (const auto& done : running) done();
  }
  std::vector<std::function<void()>> pending;
  bool toolbarHidden = true;

 private:
  void push(std::function<void()> done) { pending.push_back(std::move(done)); }
};

std::shared_ptr<NavigationController> loadedNavigation() {
  auto navigation = std::make_shared<NavigationController>();
  navigation->view();
  return navigation;
}

std::shared_ptr<LoggingScreen> screen(const std::string& name, Log& log) {
  auto made = std::make_shared<LoggingScreen>(name, log);
  made->setTitle(name);
  return made;
}

TEST(NavigationControllerTest, TellsDelegateAndScreensInOrder) {
  Log log;
  auto navigation = loadedNavigation();
  auto told = std::make_shared<NavigationLog>(log);
  navigation->setDelegate(told);
  navigation->setViewControllers({screen("root", log)}, false);
  log.clear();
  navigation->pushViewController(screen("next", log), true);
  EXPECT_THAT(log, ElementsAre("will show next", "root will disappear", "next load", "next will appear",
                               "root did disappear", "next did appear", "did show next"));
  EXPECT_EQ(navigation->topViewController()->navigationController(), navigation);
}

TEST(NavigationControllerTest, WithAHostDidShowWaitsForTheTransition) {
  Log log;
  SlowHost host;
  auto navigation = loadedNavigation();
  auto told = std::make_shared<NavigationLog>(log);
  navigation->setDelegate(told);
  navigation->setHost(&host);
  navigation->setViewControllers({screen("a", log)}, true);
  EXPECT_THAT(log, ElementsAre("will show a", "a load", "a will appear"));
  host.finish();
  EXPECT_EQ(log.back(), "did show a");
}

TEST(NavigationControllerTest, AChangeDuringATransitionEndsItFirstAndOnce) {
  Log log;
  SlowHost host;
  auto navigation = loadedNavigation();
  auto told = std::make_shared<NavigationLog>(log);
  navigation->setDelegate(told);
  navigation->setHost(&host);
  navigation->setViewControllers({screen("a", log)}, true);
  navigation->pushViewController(screen("b", log), true);
  host.finish();
  EXPECT_EQ(std::count(log.begin(), log.end(), "did show a"), 1);
  EXPECT_EQ(std::count(log.begin(), log.end(), "did show b"), 1);
  EXPECT_LT(std::find(log.begin(), log.end(), "did show a"), std::find(log.begin(), log.end(), "will show b"));
}

TEST(NavigationControllerTest, TheRootIsNeverPoppedAndPoppedScreensForgetTheStack) {
  Log log;
  auto navigation = loadedNavigation();
  auto top = screen("top", log);
  navigation->setViewControllers({screen("root", log), screen("middle", log), top, nullptr}, false);
  EXPECT_EQ(navigation->viewControllers().size(), 3u);
  EXPECT_EQ(navigation->popToRootViewControllerAnimated(false).size(), 2u);
  EXPECT_EQ(top->navigationController(), nullptr);
  EXPECT_EQ(navigation->popViewControllerAnimated(true), nullptr);
}

TEST(NavigationControllerTest, GoingBackByHandIsNotPlayedAgain) {
  Log log;
  SlowHost host;
  auto navigation = loadedNavigation();
  navigation->setViewControllers({screen("root", log), screen("top", log)}, false);
  navigation->setHost(&host);
  navigation->userWentBackTo(1);
  EXPECT_EQ(navigation->topViewController()->title(), "root");
  EXPECT_TRUE(host.pending.empty());
}

TEST(NavigationControllerTest, ASubclassMayBuildItsStackBeforeTheBaseLoads) {
  struct Early : NavigationController {
    void viewDidLoad() override {
      setViewControllers({std::make_shared<ViewController>()}, false);
      NavigationController::viewDidLoad();
    }
  };
  auto window = std::make_shared<Window>(Rect{0, 0, 400, 700});
  auto navigation = std::make_shared<Early>();
  window->setRootViewController(navigation);
  EXPECT_FALSE(navigation->isViewLoaded());
  window->makeKeyAndVisible();
  const ViewControllerRef top = navigation->topViewController();
  EXPECT_TRUE(top->view()->isInWindow());
  EXPECT_EQ(top->view()->frame(), (Rect{0, 0, 400, 700}));
  EXPECT_EQ(top->appearanceState(), AppearanceState::Appeared);
}

TEST(WindowTest, ScreensHearOfANewSizeBeforeTheirViewsChange) {
  Log log;
  auto window = std::make_shared<Window>(Rect{0, 0, 400, 700});
  auto root = screen("root", log);
  window->setRootViewController(root);
  window->makeKeyAndVisible();
  window->resize({900, 500}, true);
  EXPECT_EQ(log.back(), "root to width 900");
  EXPECT_EQ(root->view()->frame(), (Rect{0, 0, 900, 500}));
  TraitCollection traits;
  traits.horizontalSizeClass = SizeClass::Regular;
  window->setTraitCollection(traits);
  EXPECT_EQ(root->view()->traitCollection(), traits);
  window.reset();
  EXPECT_FALSE(root->view()->isInWindow());
}

TEST(PresentationTest, AChildPresentsOverItsOutermostParentAndTheWindowCarriesIt) {
  Log log;
  auto window = std::make_shared<Window>();
  auto navigation = std::make_shared<NavigationController>();
  auto top = screen("top", log);
  navigation->setViewControllers({top}, false);
  window->setRootViewController(navigation);
  window->makeKeyAndVisible();
  auto sheet = screen("sheet", log);
  bool stood = false;
  top->presentViewController(sheet, true, [&] { stood = true; });
  EXPECT_TRUE(stood);
  EXPECT_EQ(navigation->presentedViewController(), sheet);
  EXPECT_EQ(top->presentedViewController(), sheet);
  EXPECT_EQ(navigation->visibleViewController(), sheet);
  EXPECT_EQ(sheet->presentingViewController(), navigation.get());
  EXPECT_TRUE(sheet->view()->isInWindow());
  bool gone = false;
  navigation->dismissViewControllerAnimated(true, [&] { gone = true; });
  EXPECT_TRUE(gone);
  EXPECT_FALSE(sheet->view()->isInWindow());
  EXPECT_EQ(log.back(), "sheet did disappear");
  EXPECT_EQ(navigation->visibleViewController(), top);
}

TEST(PresentationTest, DismissingNothingStillCompletes) {
  auto alone = std::make_shared<ViewController>();
  bool completed = false;
  alone->dismissViewControllerAnimated(false, [&] { completed = true; });
  EXPECT_TRUE(completed);
}

TEST(PresentationTest, DismissingTakesEverythingAboveAway) {
  auto root = std::make_shared<ViewController>();
  auto first = std::make_shared<ViewController>();
  auto second = std::make_shared<ViewController>();
  root->presentViewController(first, false);
  root->presentViewController(second, false);
  EXPECT_EQ(first->presentedViewController(), second);
  root->dismissViewControllerAnimated(false);
  EXPECT_EQ(root->presentedViewController(), nullptr);
  EXPECT_EQ(second->presentingViewController(), nullptr);
}

TEST(PresentationTest, DismissedBeforeItStoodItNeverAppears) {
  Log log;
  SlowHost host;
  auto window = std::make_shared<Window>();
  window->setPresentationHost(&host);
  auto root = screen("root", log);
  window->setRootViewController(root);
  window->makeKeyAndVisible();
  auto sheet = screen("sheet", log);
  root->presentViewController(sheet, true);
  root->dismissViewControllerAnimated(true);
  host.finish();
  EXPECT_EQ(std::count(log.begin(), log.end(), "sheet did appear"), 0);
  EXPECT_EQ(std::count(log.begin(), log.end(), "sheet did disappear"), 1);
}

class AlertTest : public testing::Test {
 protected:
  ViewControllerRef root = std::make_shared<ViewController>();
  std::shared_ptr<AlertController> alert = AlertController::make(AlertStyle::Alert, "Title", "Message");
};

TEST_F(AlertTest, TheHandlerMayShowTheNextAlert) {
  auto next = AlertController::make(AlertStyle::Alert, "Next", "");
  auto action = AlertAction::make("OK", AlertActionStyle::Default,
                                  [&](const AlertActionRef&) { root->presentViewController(next, true); });
  alert->addAction(action);
  root->presentViewController(alert, true);
  EXPECT_TRUE(alert->performAction(action));
  EXPECT_EQ(root->presentedViewController(), next);
}

TEST_F(AlertTest, AnActionThatMayNotDismissKeepsTheAlertAndItsHandlerQuiet) {
  bool handled = false;
  auto action = AlertAction::make("Done", AlertActionStyle::Default, [&](const AlertActionRef&) { handled = true; });
  bool may = false;
  action->setShouldDismiss([&] { return may; });
  alert->addAction(action);
  root->presentViewController(alert, true);
  EXPECT_FALSE(alert->performAction(action));
  EXPECT_EQ(root->presentedViewController(), alert);
  EXPECT_FALSE(handled);
  may = true;
  action->setEnabled(false);
  EXPECT_FALSE(alert->performAction(action));
  action->setEnabled(true);
  EXPECT_TRUE(alert->performAction(action));
  EXPECT_TRUE(handled);
  EXPECT_EQ(root->presentedViewController(), nullptr);
}

TEST_F(AlertTest, WavingItAwayNeedsACancelAction) {
  root->presentViewController(alert, true);
  EXPECT_FALSE(alert->cancel());
  alert->addAction(AlertAction::make("Cancel", AlertActionStyle::Cancel));
  EXPECT_TRUE(alert->cancel());
  EXPECT_EQ(root->presentedViewController(), nullptr);
}

TEST_F(AlertTest, FieldsAndContentStandInItsViewWhenAddedBeforeOrAfterLoading) {
  std::shared_ptr<TextField> before;
  alert->addTextField([&](const std::shared_ptr<TextField>& field) { before = field; });
  alert->view();
  auto content = std::make_shared<ViewController>();
  alert->setContentViewController(content);
  EXPECT_EQ(before->superview(), alert->view().get());
  EXPECT_EQ(content->view()->superview(), alert->view().get());
  EXPECT_EQ(content->parent(), alert.get());
}

struct ListLog : DocumentListControllerDelegate {
  void documentListControllerDidSelectContainerWithViewController(const DocumentListControllerRef&,
                                                                  const DocumentListControllerRef&) override {}
  void documentListControllerDidSelectItemAtURL(const DocumentListControllerRef&, const URL& url) override {
    chosen.push_back(url.path());
  }
  void documentListControllerItemsChanged(const DocumentListControllerRef&) override { ++itemsChanged; }
  void documentListControllerURLWasRemoved(const DocumentListControllerRef&) override {}
  void documentListControllerPerformActionURLOriginatingViewCompletion(const DocumentListControllerRef&, int code,
                                                                       const URL&, const ViewRef&, Completion) override {
    chosen.push_back(std::to_string(code));
  }
  void documentListControllerPerformActionURL(const DocumentListControllerRef&, int, const URL&) override {}
  ViewControllerRef documentListControllerViewControllerForPreviewingItemAtURL(const DocumentListControllerRef&,
                                                                               const URL&) override {
    return nullptr;
  }
  int itemsChanged = 0;
  std::vector<std::string> chosen;
};

class DocumentListTest : public testing::Test {
 protected:
  DocumentListTest() { list->setDelegate(told); }
  URL a{"/drive/a"};
  URL b{"/drive/b"};
  DocumentListControllerRef list = std::make_shared<DocumentListController>(URL("/drive", true));
  std::shared_ptr<ListLog> told = std::make_shared<ListLog>();
};

TEST_F(DocumentListTest, SelectionFollowsTheItems) {
  list->itemsLoaded({a, b});
  list->setSelectedItems({b, a, URL("/drive/c")});
  EXPECT_THAT(list->selectedItems(), ElementsAre(a, b));
  list->setSelectedItems({a, b});
  EXPECT_EQ(told->itemsChanged, 2);
  list->itemsLoaded({b});
  EXPECT_THAT(list->selectedItems(), ElementsAre(b));
  EXPECT_EQ(told->itemsChanged, 3);
}

TEST_F(DocumentListTest, AllIsSelectedByPlacesAndReportedOnce) {
  list->itemsLoaded({a, b});
  told->itemsChanged = 0;
  list->selectAllItems();
  list->userSelected({0, 1});
  EXPECT_EQ(told->itemsChanged, 1);
  EXPECT_EQ(list->selectedItemCount(), 2u);
  EXPECT_THAT(list->selectedItems(), ElementsAre(a, b));
  list->userSelected({1});
  EXPECT_THAT(list->selectedItems(), ElementsAre(b));
  EXPECT_THAT(list->selection(), ElementsAre(1u));
}

TEST_F(DocumentListTest, SelectedItemsOfWhichEnoughIsKnownNeedNoLook) {
  const std::vector<URL> items{a, b, URL("/drive/c")};
  constexpr ItemHint hints[] = {ItemHint::Document, ItemHint::Folder, ItemHint::Unknown};
  list->itemsLoaded(URLList(
      3, [items](std::size_t i) { return items[i]; }, [](const URL&, std::size_t guess) { return std::optional(guess); },
      [&hints](std::size_t i) { return hints[i]; }));
  list->selectAllItems();
  EXPECT_THAT(list->selectedItemsThatMayBeFolders(), ElementsAre(b, items[2]));
  EXPECT_THAT(list->selectedItemsThatMayBeSpecial(), ElementsAre(items[2]));
  list->userSelected({0});
  EXPECT_TRUE(list->selectedItemsThatMayBeFolders().empty());
}

TEST_F(DocumentListTest, LeavingEditingClearsTheSelectionWithoutAReport) {
  list->itemsLoaded({a});
  list->setEditingAnimated(true, true);
  list->setSelectedItems({a});
  told->itemsChanged = 0;
  list->setEditingAnimated(false, true);
  EXPECT_TRUE(list->selectedItems().empty());
  EXPECT_EQ(told->itemsChanged, 0);
}

TEST_F(DocumentListTest, ADelegateThatIsGoneLeavesNoActionHanging) {
  told.reset();
  bool completed = false;
  list->userChoseAction(ItemAction::Delete, a, nullptr, [&] { completed = true; });
  EXPECT_TRUE(completed);
}

TEST_F(DocumentListTest, ASecondSearchGoesToTheControllerThatIsThere) {
  list->startSearchWithQueryStringBecomeFirstResponder("", true);
  const auto search = std::dynamic_pointer_cast<SearchController>(list->presentedViewController());
  ASSERT_TRUE(search);
  EXPECT_TRUE(search->wantsFocus());
  list->startSearchWithQueryStringBecomeFirstResponder("tax", false);
  EXPECT_EQ(list->presentedViewController(), search);
  EXPECT_EQ(search->query(), "tax");
}

TEST_F(DocumentListTest, AttachmentsLiveWithTheList) {
  auto object = std::make_shared<int>(7);
  const std::weak_ptr<int> weak = object;
  list->setAttachment("key", std::move(object));
  EXPECT_EQ(*list->attachmentAs<int>("key"), 7);
  list.reset();
  EXPECT_TRUE(weak.expired());
}

TEST(DocumentTargetSelectionTest, CancellingTakesThePickerAway) {
  auto root = std::make_shared<ViewController>();
  auto picker = std::make_shared<DocumentTargetSelectionController>(std::vector<URL>{URL("/drive/a")}, false);
  root->presentViewController(picker, true);
  picker->userCancelled();
  EXPECT_EQ(root->presentedViewController(), nullptr);
}

TEST(PreviewControllerTest, WithoutADataSourceItShowsNothing) {
  auto preview = std::make_shared<PreviewController>();
  EXPECT_EQ(preview->itemCount(), 0u);
  EXPECT_FALSE(preview->canEditItem(URL("/a.pdf")));
}

}  // namespace
}  // namespace vaelo
