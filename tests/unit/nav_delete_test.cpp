// SPDX-License-Identifier: GPL-3.0-or-later
// The deletion of items and libraries, from the question to what went wrong.
#include <gmock/gmock.h>

#include <algorithm>

#include "fileops/ui_utils.h"
#include "platform/ui/alert_controller.h"
#include "tests/unit/app_fixture.h"

namespace vaelo {
namespace {

using ::testing::ElementsAre;
using ::testing::SizeIs;

class NavDeleteTest : public AppFixture {
 protected:
  NavDeleteTest() {
    memory.formatting.translations[".DICT.CANNOT_DELETE_ITEMS.%d"] = "not deleted: %@";
    loadNav();
    log().clear();
  }
  void ask(const std::vector<URL>& urls, const ViewRef& view = nullptr,
           const std::shared_ptr<DocumentListController>& list = nullptr) {
    nav->showWarningAndDeleteURLsUsingViewWithDocumentListControllerFinishedCompletion(urls, view, list, [this] {
      ++finished;
      if (whenFinished) whenFinished();
    });
  }
  void answer(bool yes) {
    const auto sheet = presentedAlert();
    ASSERT_NE(sheet, nullptr);
    sheet->performAction(sheet->actions().at(yes ? 0 : 1));
  }
  bool isThere(const URL& url) { return memory.disk.logicalItem(url.path()) != nullptr; }

  int finished = 0;
  std::function<void()> whenFinished;
};

TEST_F(NavDeleteTest, OneDocumentIsNamedInStraightQuotes) {
  ask({addFile("Report.pdf")});
  const auto sheet = presentedAlert();
  ASSERT_NE(sheet, nullptr);
  EXPECT_EQ(sheet->style(), AlertStyle::ActionSheet);
  EXPECT_EQ(sheet->title(), "");
  EXPECT_EQ(
      sheet->message(),
      "\"Report.pdf\" will be permanently deleted from Vaelo Drive on all your devices. This action cannot be undone.");
  ASSERT_THAT(sheet->actions(), SizeIs(2));
  EXPECT_EQ(sheet->actions()[0]->title(), "Delete from Vaelo Drive");
  EXPECT_EQ(sheet->actions()[0]->style(), AlertActionStyle::Destructive);
  EXPECT_EQ(sheet->actions()[1]->title(), "Cancel");
  EXPECT_EQ(sheet->actions()[1]->style(), AlertActionStyle::Cancel);
}

TEST_F(NavDeleteTest, SeveralItemsAreCountedAndALibraryIsNamed) {
  ask({addFile("a.txt"), addFile("b.txt")});
  EXPECT_EQ(presentedAlert()->message(),
            "items: 2 will be permanently deleted from Vaelo Drive on all your devices. This action cannot be undone.");
  answer(false);
  const auto library = memory.cloud.addContainer("org~example~Notes", "Notes");
  ask({*library->documentsFolderURL()});
  EXPECT_EQ(
      presentedAlert()->message(),
      "The Notes app library, and all its documents, will be permanently deleted from Vaelo Drive on all your devices. "
      "This action cannot be undone.");
}

TEST_F(NavDeleteTest, TheSheetPointsAtTheViewOrTheButton) {
  const auto view = std::make_shared<View>(Rect{5, 6, 200, 40});
  ask({addFile("a.txt")}, view);
  const auto anchor = presentedAlert()->popoverAnchor();
  EXPECT_EQ(anchor->sourceView.lock(), view);
  EXPECT_EQ(anchor->sourceRect, (Rect{0, 20, 200, 0}));
  EXPECT_EQ(anchor->permittedArrowDirections, ArrowLeft | ArrowRight);
  answer(false);
  nav->setEditModeAndUpdateUIForViewController(true, topList());
  ask({addFile("a.txt")});
  EXPECT_EQ(presentedAlert()->popoverAnchor()->barButtonItem, nav->barButtonDeleteItem());
  EXPECT_EQ(presentedAlert()->popoverAnchor()->sourceView.lock(), nullptr);
}

// The middle of 40 points that begin at 100 is at 120.
TEST_F(NavDeleteTest, TheSheetPointsIntoAScrolledView) {
  const auto view = std::make_shared<View>(Rect{5, 6, 200, 40});
  view->setBounds({30, 100, 200, 40});
  ask({addFile("a.txt")}, view);
  EXPECT_EQ(presentedAlert()->popoverAnchor()->sourceRect, (Rect{30, 120, 200, 0}));
}

TEST_F(NavDeleteTest, TheAnswerComesWithTheActionThatWasChosen) {
  const URL file = addFile("a.txt");
  for (const std::size_t index : {std::size_t{0}, std::size_t{1}}) {
    AlertActionRef chosen;
    std::optional<bool> cancelled;
    UIUtils::showDeleteWarningAlertHasContainerViewControllerUsingViewUsingButtonCompletion(
        {file}, false, nav, nullptr, nullptr, [&](const AlertActionRef& action, bool gaveUp) {
          chosen = action;
          cancelled = gaveUp;
        });
    const auto sheet = presentedAlert();
    sheet->performAction(sheet->actions().at(index));
    EXPECT_EQ(chosen, sheet->actions().at(index));
    EXPECT_EQ(cancelled, index == 1);
  }
}

TEST_F(NavDeleteTest, NoItemsAreGivenUpWithoutAnAction) {
  int answers = 0;
  UIUtils::showDeleteWarningAlertHasContainerViewControllerUsingViewUsingButtonCompletion(
      {}, false, nav, nullptr, nullptr, [&](const AlertActionRef& action, bool gaveUp) {
        ++answers;
        EXPECT_EQ(action, nullptr);
        EXPECT_TRUE(gaveUp);
      });
  EXPECT_EQ(answers, 1);
  EXPECT_EQ(UIUtils::messageForDeletePrompt({}),
            "items: 0 will be permanently deleted from Vaelo Drive on all your devices. This action cannot be undone.");
}

TEST_F(NavDeleteTest, AnItemWhoseNameIsEmptyIsNotAskedFor) {
  const URL file = addFile("a.txt");
  memory.disk.items.at(file.path()).values[ResourceKey::LocalizedName] = Value("");
  ASSERT_NE(DRItem::initWithURL(file), nullptr);
  ask({file});
  EXPECT_EQ(presentedAlert(), nullptr);
  EXPECT_EQ(finished, 0);
}

TEST_F(NavDeleteTest, NoItemsAndNamelessOnesAskNothing) {
  ask({});
  EXPECT_EQ(presentedAlert(), nullptr);
  EXPECT_EQ(finished, 1);
  EXPECT_TRUE(logged("INFO", "================= Delete was Cancelled (nav)"));
  ask({URL("/drive/mirror/com~marrow~Kestrel/gone")});
  EXPECT_EQ(presentedAlert(), nullptr);
  EXPECT_EQ(finished, 1) << "the silent end";
}

TEST_F(NavDeleteTest, MixedSelectionsAreRefusedSilently) {
  const auto library = memory.cloud.addContainer("org~example~Notes", "Notes");
  ask({*library->documentsFolderURL(), addFile("a.txt")});
  EXPECT_EQ(presentedAlert(), nullptr);
  EXPECT_EQ(finished, 1);
  EXPECT_TRUE(loggedStarting("ERROR", "Not Deleting: mix of containers and items: ("));
}

// Both refusals would do; the one that comes first tells nobody.
TEST_F(NavDeleteTest, ALibraryBesideASpecialFolderIsRefusedSilently) {
  const auto library = memory.cloud.addContainer("org~example~Notes", "Notes");
  ask({addFolder("Desktop"), *library->documentsFolderURL()});
  EXPECT_EQ(presentedAlert(), nullptr);
  EXPECT_EQ(finished, 1);
  EXPECT_TRUE(loggedStarting("ERROR", "Not Deleting: mix of containers and items: ("));
  EXPECT_FALSE(loggedStarting("WARNING", "Not deleting special folder: "));
}

TEST_F(NavDeleteTest, SpecialFoldersAreRefusedAloud) {
  const URL desktop = addFolder("Desktop");
  whenFinished = [this] { EXPECT_EQ(presentedAlert(), nullptr) << "the alert comes after"; };
  ask({desktop});
  EXPECT_EQ(finished, 1);
  EXPECT_TRUE(logged("WARNING", "Not deleting special folder: (" + desktop.absoluteString() + ")"));
  ASSERT_NE(presentedAlert(), nullptr);
  EXPECT_THAT(presentedAlert()->actions(), SizeIs(1));
  EXPECT_EQ(presentedAlert()->title(), "This can’t be done with this item.");
  EXPECT_TRUE(isThere(desktop));
}

TEST_F(NavDeleteTest, CancelKeepsEverythingAsItIs) {
  const URL file = addFile("a.txt");
  nav->setEditModeAndUpdateUIForViewController(true, topList());
  ask({file}, nullptr, topList());
  answer(false);
  EXPECT_TRUE(isThere(file));
  EXPECT_TRUE(nav->editMode());
  EXPECT_EQ(finished, 1);
  EXPECT_TRUE(logged("INFO", "Delete: Cancel pressed"));
  EXPECT_EQ(userActions().back(), "Delete was Cancelled (nav)");
  EXPECT_TRUE(logged("INFO", "================= Delete was Cancelled (nav)"));
}

TEST_F(NavDeleteTest, ConfirmedItemsGoAndEditModeEnds) {
  const URL file = addFile("a.txt");
  nav->setEditModeAndUpdateUIForViewController(true, topList());
  ask({file}, nullptr, topList());
  EXPECT_EQ(finished, 0) << "only after the answer";
  whenFinished = [&] {
    EXPECT_FALSE(isThere(file));
    EXPECT_FALSE(nav->editMode());
  };
  answer(true);
  EXPECT_FALSE(isThere(file));
  EXPECT_FALSE(nav->editMode());
  EXPECT_EQ(finished, 1);
  const std::vector<std::string> lines = log().messages();
  const auto answered = std::find(lines.begin(), lines.end(), "DEBUG Delete action");
  ASSERT_NE(answered, lines.end());
  EXPECT_NE(std::find(answered, lines.end(), "INFO ================= Delete was Confirmed (nav)"), lines.end());
  EXPECT_TRUE(logged("INFO", "Deleting item " + file.absoluteString()));
  EXPECT_EQ(presentedAlert(), nullptr);
}

TEST_F(NavDeleteTest, EditModeEndsBeforeAnythingGoes) {
  const URL file = addFile("a.txt");
  nav->setEditModeAndUpdateUIForViewController(true, topList());
  ask({file}, nullptr, topList());
  int accesses = 0;
  memory.coordination.beforeAccessor = [&] {
    ++accesses;
    EXPECT_TRUE(isThere(file));
    EXPECT_FALSE(nav->editMode());
  };
  answer(true);
  memory.coordination.beforeAccessor = nullptr;
  EXPECT_GT(accesses, 0);
}

// "the document's own name", not that of its file.
TEST_F(NavDeleteTest, TheQuestionNamesADocumentAsPeopleSeeIt) {
  const URL file = addFile("Report.pdf");
  memory.disk.items.at(file.path()).values[ResourceKey::LocalizedName] = Value("Report");
  EXPECT_EQ(UIUtils::messageForDeletePrompt({file}),
            "\"Report\" will be permanently deleted from Vaelo Drive on all your devices. This action cannot be undone.");
}

TEST_F(NavDeleteTest, WithoutAListEditModeIsNotTouched) {
  nav->setEditModeAndUpdateUIForViewController(true, topList());
  ask({addFile("a.txt")});
  answer(true);
  EXPECT_TRUE(nav->editMode());
}

TEST_F(NavDeleteTest, EveryItemIsTriedAndFailuresAreToldOnce) {
  const URL first = addFile("a.txt");
  const URL second = addFile("b.txt");
  const URL third = addFile("c.txt");
  ask({first, second, third});
  memory.disk.items.at(first.path()).isLocked = memory.disk.items.at(second.path()).isLocked = true;
  whenFinished = [&] {
    EXPECT_FALSE(isThere(third));
    EXPECT_EQ(presentedAlert(), nullptr) << "failures are told last";
  };
  answer(true);
  EXPECT_FALSE(isThere(third));
  ASSERT_NE(presentedAlert(), nullptr);
  EXPECT_EQ(presentedAlert()->title(), "not deleted: 2");
  EXPECT_EQ(presentedAlert()->message(), "");
  const Error locked = memoryError(FileErrorCode::WriteNoPermission, first.path());
  EXPECT_TRUE(logged("WARNING", "Failed to delete URL " + first.absoluteString() + ": " + locked.description()));
  EXPECT_TRUE(loggedStarting("WARNING", "Failed to delete URL " + second.absoluteString() + ": "));
  EXPECT_EQ(finished, 1);
}

TEST_F(NavDeleteTest, OneFailureIsToldInItsOwnWords) {
  const URL file = addFile("a.txt");
  ask({file});
  memory.disk.items.at(file.path()).isLocked = true;
  answer(true);
  ASSERT_NE(presentedAlert(), nullptr);
  EXPECT_EQ(presentedAlert()->title(), "It can't be used");
  EXPECT_EQ(presentedAlert()->message(), "");
  EXPECT_EQ(finished, 1);
}

TEST_F(NavDeleteTest, ALibraryIsEmptiedByItsService) {
  const auto library = memory.cloud.addContainer("org~example~Notes", "Notes");
  ask({*library->documentsFolderURL()});
  answer(true);
  EXPECT_EQ(library->deletions, 1);
  EXPECT_TRUE(logged("INFO", "Deleting container org~example~Notes"));
  library->deletionError = Error{CloudDocumentsErrorDomain, 3, {}, "No such luck", {}};
  ask({*library->documentsFolderURL()});
  answer(true);
  EXPECT_EQ(presentedAlert()->title(), "No such luck");
  EXPECT_TRUE(logged("WARNING", "Failed to delete container org~example~Notes: " + library->deletionError->description()));
}

TEST_F(NavDeleteTest, ALibraryThatFailsDoesNotStopTheNext) {
  const auto first = memory.cloud.addContainer("org~example~Drawings", "Drawings");
  const auto second = memory.cloud.addContainer("org~example~Notes", "Notes");
  first->deletionError = Error{CloudDocumentsErrorDomain, 3, {}, "No such luck", {}};
  ask({Drive, *first->documentsFolderURL(), *second->documentsFolderURL()});
  answer(true);
  EXPECT_EQ(second->deletions, 1);
  EXPECT_EQ(presentedAlert()->title(), "not deleted: 2") << "the drive's own counts as well";
}

TEST_F(NavDeleteTest, TheDrivesOwnContainerIsNeverDeleted) {
  ask({Drive});
  ASSERT_NE(presentedAlert(), nullptr);
  answer(true);
  EXPECT_TRUE(logged("ERROR", "NOT Deleting root container com~marrow~Kestrel"));
  EXPECT_EQ(memory.cloud.drive->deletions, 0);
  ASSERT_NE(presentedAlert(), nullptr);
  EXPECT_EQ(presentedAlert()->title(), "Error exception") << "no error was recorded";
}

TEST_F(NavDeleteTest, ALibraryThatCannotBeFoundIsAFailure) {
  const auto library = memory.cloud.addContainer("org~example~Notes", "Notes");
  const URL url = *library->documentsFolderURL();
  ask({url});
  memory.cloud.containerError = Error{CloudDocumentsErrorDomain, 1, {}, "lost", {}};
  answer(true);
  EXPECT_TRUE(loggedStarting("WARNING", "No container for URL " + url.absoluteString() + ": "));
  EXPECT_EQ(presentedAlert()->title(), "Error exception");
  EXPECT_EQ(library->deletions, 0);
}

TEST_F(NavDeleteTest, AnErrorBesideALibraryAndALibraryWithoutAnIdentifierAreFailures) {
  const auto library = memory.cloud.addContainer("org~example~Notes", "Notes");
  const URL url = *library->documentsFolderURL();
  ask({url});
  memory.cloud.containerError = Error{CloudDocumentsErrorDomain, 1, {}, "lost", {}};
  memory.cloud.containerErrorComesWithValue = true;
  answer(true);
  EXPECT_TRUE(
      logged("WARNING", "No container for URL " + url.absoluteString() + ": " + memory.cloud.containerError->description()));
  EXPECT_EQ(presentedAlert()->title(), "Error exception");
  nav->dismissViewControllerAnimated(false);
  memory.cloud.containerError.reset();
  ask({url});
  const auto nameless = std::make_shared<MemoryContainer>("", "Notes", url);
  memory.cloud.containerOfEverything = nameless;
  answer(true);
  EXPECT_TRUE(logged("WARNING", "No container for URL " + url.absoluteString() + ": (null)"));
  EXPECT_EQ(presentedAlert()->title(), "Error exception");
  EXPECT_EQ(library->deletions + nameless->deletions, 0);
}

TEST_F(NavDeleteTest, TheToolbarsButtonDeletesTheSelection) {
  const URL file = addFile("a.txt");
  topList()->itemsLoaded({file});
  nav->setEditModeAndUpdateUIForViewController(true, topList());
  topList()->setSelectedItems({file});
  nav->showWarningAndDeleteDocument();
  EXPECT_TRUE(logged("INFO", "================= Pressed Delete (nav)"));
  EXPECT_TRUE(logged("INFO", "Pressed Delete after selecting 1 items: (" + file.absoluteString() + ")"));
  answer(true);
  EXPECT_FALSE(isThere(file));
  EXPECT_FALSE(nav->editMode());
}

}  // namespace
}  // namespace vaelo
