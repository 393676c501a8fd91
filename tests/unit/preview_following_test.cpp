// SPDX-License-Identifier: GPL-3.0-or-later
// How a manager follows its document: changes, moves, deletions, and what other devices are told.
#include "tests/unit/preview_fixture.h"

namespace vaelo {
namespace {

using std::chrono::milliseconds;
using std::chrono::seconds;
using ::testing::SizeIs;
using PreviewFollowingTest = PreviewFixture;

TEST_F(PreviewFollowingTest, NoticesWithinASecondMakeOneRefreshASecondAfterTheFirst) {
  setModified(document, seconds(10));
  const auto manager = show();
  const std::string refreshed = "Refreshing " + text(document);
  memory.coordination.othersChanged(document);
  advance(milliseconds(200));
  EXPECT_TRUE(manager->refreshPending());
  memory.coordination.othersChanged(document);
  advance(milliseconds(799));
  EXPECT_EQ(times("INFO", refreshed), 0u);
  advance(milliseconds(1));
  EXPECT_EQ(times("INFO", refreshed), 1u);
  EXPECT_FALSE(manager->refreshPending());
  EXPECT_EQ(times("INFO", "presentedItemDidChange: " + text(document)), 2u);
  advance(seconds(5));
  EXPECT_EQ(times("INFO", refreshed), 1u);
  memory.coordination.othersChanged(document);
  advance(seconds(1));
  EXPECT_EQ(times("INFO", refreshed), 2u) << "a later notice begins anew";
}

TEST_F(PreviewFollowingTest, ALaterDateReloadsTheVisibleQuickPreview) {
  setModified(document, seconds(10));
  const auto manager = show();
  int reloads = 0;
  const auto token = countReloads(reloads);
  ASSERT_TRUE(glimpse()->isVisible());
  setModified(document, seconds(20));
  memory.coordination.othersChanged(document);
  advance(seconds(1));
  EXPECT_EQ(reloads, 1);
  EXPECT_TRUE(logged("DEBUG", "GLPreviewController: refreshCurrentPreviewItem"));
  EXPECT_EQ(manager->modifiedDate(), Date(seconds(20)));
  EXPECT_TRUE(loggedStarting("DEBUG", text(document) + ": modDate "));
}

TEST_F(PreviewFollowingTest, TheSameDateChangesTheTitleAlone) {
  setModified(document, seconds(10));
  const auto manager = show();
  const auto stack = nav->viewControllers();
  glimpse()->setTitle("old");
  int others = 0;
  const auto otherToken = glimpse()->previewChanged().connect([&others](PreviewController&, PreviewChange) { ++others; });
  int reloads = 0;
  const auto token = countReloads(reloads);
  const auto before = manager->item();
  memory.coordination.othersChanged(document);
  advance(seconds(1));
  EXPECT_EQ(reloads, 0);
  EXPECT_EQ(glimpse()->title(), *manager->item()->localizedName());
  EXPECT_NE(manager->item(), before) << "the fresh record is the item";
  EXPECT_EQ(others, 0) << "and nothing was prepared anew";
  EXPECT_EQ(nav->viewControllers(), stack);
}

TEST_F(PreviewFollowingTest, TheTitleIsKeptUpAlsoBehindTheDetails) {
  setModified(document, seconds(10));
  const auto manager = show(1);
  glimpse()->setTitle("old");
  int reloads = 0;
  const auto token = countReloads(reloads);
  setModified(document, seconds(20));
  memory.coordination.othersChanged(document);
  advance(seconds(1));
  EXPECT_EQ(glimpse()->title(), "Report.pdf");
  EXPECT_EQ(reloads, 0) << "it is not visible";
  EXPECT_FALSE(logged("DEBUG", "GLPreviewController: refreshCurrentPreviewItem"));
}

TEST_F(PreviewFollowingTest, TheDatesAreLoggedFormerFirst) {
  setModified(document, seconds(10));
  const auto manager = show();
  setModified(document, seconds(20));
  memory.coordination.othersChanged(document);
  advance(seconds(1));
  EXPECT_TRUE(logged("DEBUG", text(document) + ": modDate " + Value(Date(seconds(10))).description() + " vs " +
                                  Value(Date(seconds(20))).description()));
  forgetModified(document);
  memory.coordination.othersChanged(document);
  advance(seconds(1));
  EXPECT_EQ(manager->modifiedDate(), std::nullopt) << "always that of the fresh record";
}

TEST_F(PreviewFollowingTest, AnotherPathAtARefreshIsSaidAndShown) {
  const auto manager = show(1);
  const auto former = manager->detailsViewController();
  const auto other = DRItem::initWithURL(addFile("Plans/Other.pdf"));
  memory.coordination.othersChanged(document);
  advance(milliseconds(999));
  bool changed = false;
  memory.coordination.beforeAccessor = [&] {
    if (!std::exchange(changed, true)) manager->setItemUpdatePreview(other, false);
  };
  advance(milliseconds(1));
  memory.coordination.beforeAccessor = nullptr;
  EXPECT_TRUE(logged("ERROR", "UNEXPECTED: path changed but we only got a presentedItemDidChange: " + other->url()->path() +
                                  " to " + document.path()));
  EXPECT_EQ(manager->item()->url(), document);
  EXPECT_NE(manager->detailsViewController(), former) << "prepared anew";
  EXPECT_EQ(top(), manager->detailsViewController());
}

TEST_F(PreviewFollowingTest, AnEarlierDateIsTakenButReloadsNothing) {
  setModified(document, seconds(10));
  const auto manager = show();
  int reloads = 0;
  const auto token = countReloads(reloads);
  setModified(document, seconds(5));
  memory.coordination.othersChanged(document);
  advance(seconds(1));
  EXPECT_EQ(reloads, 0);
  EXPECT_EQ(manager->modifiedDate(), Date(seconds(5)));
}

TEST_F(PreviewFollowingTest, WithoutAStoredDateTheFirstRefreshReloadsNothing) {
  forgetModified(document);
  const auto manager = show();
  ASSERT_EQ(manager->modifiedDate(), std::nullopt);
  int reloads = 0;
  const auto token = countReloads(reloads);
  setModified(document, seconds(20));
  memory.coordination.othersChanged(document);
  advance(seconds(1));
  EXPECT_EQ(reloads, 0);
  EXPECT_EQ(manager->modifiedDate(), Date(seconds(20)));
}

TEST_F(PreviewFollowingTest, TheDetailsAreRefreshedWhenTheDateWentOn) {
  setModified(document, seconds(10));
  const auto manager = show(1);
  const auto details = manager->detailsViewController();
  ASSERT_NE(details, nullptr);
  details->filenameTextField()->setText("typed");
  memory.coordination.othersChanged(document);
  advance(seconds(1));
  EXPECT_EQ(details->filenameTextField()->text(), "typed") << "the date is the same";
  setModified(document, seconds(20));
  memory.coordination.othersChanged(document);
  advance(seconds(1));
  EXPECT_EQ(details->filenameTextField()->text(), *manager->item()->localizedName());
}

TEST_F(PreviewFollowingTest, ADocumentThatIsGoneAtTheRefreshChangesNothing) {
  const auto manager = show();
  const auto before = manager->item();
  memory.coordination.othersChanged(document);
  memory.disk.remove(document.path());
  advance(seconds(1));
  EXPECT_EQ(manager->item(), before);
  EXPECT_FALSE(manager->refreshPending());
}

TEST_F(PreviewFollowingTest, AManagerThatIsGoneRefreshesNothing) {
  auto manager = show();
  memory.coordination.othersChanged(document);
  advance(milliseconds(1));
  manager = nullptr;
  advance(seconds(2));
  EXPECT_EQ(times("INFO", "Refreshing " + text(document)), 0u);
  EXPECT_TRUE(memory.coordination.presenters().empty());
}

TEST_F(PreviewFollowingTest, AMoveWithinTheDriveReTargetsThePreview) {
  const auto manager = show();
  const URL moved = addFolder("Archive").appendingPathComponent("Report.pdf");
  memory.disk.move(document.path(), moved.path());
  memory.coordination.othersMoved(document, moved);
  runAllQueues();
  EXPECT_EQ(manager->item()->url(), moved);
  EXPECT_EQ(top(), glimpse());
  EXPECT_THAT(*glimpse()->arrayOfDocuments(), ::testing::ElementsAre(moved));
  EXPECT_TRUE(manager->filePresenterRegistered());
  EXPECT_TRUE(logged("INFO", "presentedItemDidMoveToURL: " + text(document) + " changed to " + text(moved)));
}

TEST_F(PreviewFollowingTest, AMoveReTargetsTheDetails) {
  const auto manager = show(1);
  const URL moved = addFolder("Archive").appendingPathComponent("Renamed.pdf");
  memory.disk.move(document.path(), moved.path());
  memory.coordination.othersMoved(document, moved);
  runAllQueues();
  ASSERT_EQ(top(), manager->detailsViewController());
  EXPECT_EQ(manager->detailsViewController()->filenameTextField()->text(), *manager->item()->localizedName());
}

TEST_F(PreviewFollowingTest, AMoveIsFollowedToTheRealPlace) {
  const auto manager = show();
  const URL archive = addFolder("Archive");
  const URL moved = archive.appendingPathComponent("Report.pdf");
  const URL link = addLink("Link", archive);
  memory.disk.move(document.path(), moved.path());
  manager->presentedItemDidMoveToURL(link.appendingPathComponent("Report.pdf"));
  runAllQueues();
  EXPECT_EQ(manager->item()->url()->path(), moved.path());
  EXPECT_TRUE(logged("INFO", "presentedItemDidMoveToURL: " + text(document) + " changed to " + text(moved)));
}

TEST_F(PreviewFollowingTest, AMoveShowsOnTheMainQueueNotBefore) {
  const auto manager = show();
  const URL moved = addFolder("Archive").appendingPathComponent("Report.pdf");
  memory.disk.move(document.path(), moved.path());
  manager->presentedItemDidMoveToURL(moved);
  EXPECT_EQ(manager->item()->url(), document);
  runAllQueues();
  EXPECT_EQ(manager->item()->url(), moved);
  EXPECT_THAT(memory.coordination.presenters(), ::testing::ElementsAre(manager.get()));
}

TEST_F(PreviewFollowingTest, AManagerThatIsGoneFollowsNoMove) {
  auto manager = show();
  const URL moved = addFolder("Archive").appendingPathComponent("Report.pdf");
  memory.disk.move(document.path(), moved.path());
  manager->presentedItemDidMoveToURL(moved);
  const std::weak_ptr<PreviewItemManager> weak = manager;
  manager = nullptr;
  EXPECT_TRUE(weak.expired());
  log().clear();
  runAllQueues();
  EXPECT_FALSE(logged("DEBUG", "Previewing " + text(moved)));
}

TEST_F(PreviewFollowingTest, AMoveOfWhatIsGoneByThenLeavesNoItem) {
  const auto manager = show();
  manager->presentedItemDidMoveToURL(addFolder("Archive").appendingPathComponent("Report.pdf"));
  runAllQueues();
  EXPECT_EQ(manager->item(), nullptr);
  EXPECT_TRUE(logged("DEBUG", "Previewing (null)"));
}

TEST_F(PreviewFollowingTest, DetailsThatWereNeverShownAreNotRefreshed) {
  const auto manager = PreviewItemManager::newItemManagerWithModeNavController(1, nullptr);
  manager->previewItem(DRItem::initWithURL(document));
  const URL moved = addFolder("Archive").appendingPathComponent("Report.pdf");
  memory.disk.move(document.path(), moved.path());
  manager->presentedItemDidMoveToURL(moved);
  runAllQueues();
  EXPECT_EQ(manager->item()->url(), moved);
  EXPECT_FALSE(manager->detailsViewController()->isViewLoaded());
}

TEST_F(PreviewFollowingTest, TheSameMoveTwiceIsSaidAndChangesNothing) {
  const auto manager = show();
  const URL moved = addFolder("Archive").appendingPathComponent("Report.pdf");
  memory.disk.move(document.path(), moved.path());
  manager->presentedItemDidMoveToURL(moved);
  manager->presentedItemDidMoveToURL(moved);
  runAllQueues();
  const std::string duplicate = "UNEXPECTED: duplicate calls to presentedItemDidMoveToURL: " + moved.path();
  EXPECT_EQ(times("WARNING", duplicate), 1u) << "both were under way; the second finds the first applied";
  const auto item = manager->item();
  manager->presentedItemDidMoveToURL(moved);
  EXPECT_EQ(times("WARNING", duplicate), 2u);
  runAllQueues();
  EXPECT_EQ(manager->item(), item);
}

TEST_F(PreviewFollowingTest, AMoveIntoTheTrashOrOutOfTheDriveClosesThePreview) {
  for (const char* place : {"/drive/mirror/.Trash/Report.pdf", "/home/user/Report.pdf"}) {
    const auto manager = show();
    ASSERT_EQ(top(), glimpse());
    manager->presentedItemDidMoveToURL(URL(place));
    EXPECT_FALSE(manager->filePresenterRegistered());
    runAllQueues();
    EXPECT_NE(top(), glimpse());
    EXPECT_EQ(manager->item()->url(), document);
  }
  EXPECT_EQ(times("INFO", "Accommodate deletion: " + text(document)), 2u);
}

TEST_F(PreviewFollowingTest, ADeletionIsAnsweredAtOnceAndClosesThePreview) {
  auto manager = show();
  int answers = 0;
  manager->accommodatePresentedItemDeletionWithCompletionHandler([&](std::optional<Error> error) {
    EXPECT_EQ(error, std::nullopt);
    EXPECT_TRUE(manager->filePresenterRegistered()) << "before anything else";
    ++answers;
  });
  EXPECT_EQ(answers, 1);
  EXPECT_FALSE(manager->filePresenterRegistered());
  EXPECT_EQ(top(), glimpse());
  manager = nullptr;  // what is to come keeps it
  runAllQueues();
  EXPECT_NE(top(), glimpse());
}

TEST_F(PreviewFollowingTest, ADeletedPartOfAPackageRefreshesThePreviewLater) {
  const auto manager = show();
  int reloads = 0;
  const auto token = countReloads(reloads);
  manager->presentedItemDidChange();
  const URL part = document.appendingPathComponent("page.txt");
  int answers = 0;
  manager->accommodatePresentedSubitemDeletionAtURLCompletionHandler(part, [&](std::optional<Error> error) {
    EXPECT_EQ(error, std::nullopt);
    ++answers;
  });
  EXPECT_EQ(answers, 1);
  EXPECT_TRUE(logged("INFO", text(document) + " accommodate subitem deletion at " + text(part)));
  EXPECT_FALSE(manager->filePresenterRegistered());
  EXPECT_EQ(reloads, 0);
  advance(seconds(1));
  EXPECT_EQ(reloads, 1);
  EXPECT_EQ(times("INFO", "Refreshing " + text(document)), 2u);
  EXPECT_FALSE(manager->refreshPending());
  EXPECT_FALSE(manager->filePresenterRegistered()) << "until the next activation";
  becomeActive();
  EXPECT_TRUE(manager->filePresenterRegistered());
}

TEST_F(PreviewFollowingTest, ADeletedPartIsAnsweredBeforeTheManagerLeaves) {
  const auto manager = show();
  bool answered = false;
  manager->accommodatePresentedSubitemDeletionAtURLCompletionHandler(document, [&](std::optional<Error>) {
    EXPECT_TRUE(manager->filePresenterRegistered());
    answered = true;
  });
  EXPECT_TRUE(answered);
}

TEST_F(PreviewFollowingTest, TheRefreshAfterADeletedPartEndsAWaitingOne) {
  const auto manager = show();
  manager->accommodatePresentedSubitemDeletionAtURLCompletionHandler(document, [](std::optional<Error>) {});
  advance(milliseconds(500));
  manager->presentedItemDidChange();
  advance(milliseconds(499));
  EXPECT_TRUE(manager->refreshPending());
  advance(milliseconds(1));
  EXPECT_FALSE(manager->refreshPending());
}

TEST_F(PreviewFollowingTest, ADeletedPartReloadsAVisiblePreviewAlone) {
  auto manager = show(1);
  int reloads = 0;
  const auto token = countReloads(reloads);
  manager->accommodatePresentedSubitemDeletionAtURLCompletionHandler(document, [](std::optional<Error>) {});
  advance(seconds(1));
  EXPECT_EQ(reloads, 0);
  EXPECT_EQ(times("INFO", "Refreshing " + text(document)), 1u);
  manager->accommodatePresentedSubitemDeletionAtURLCompletionHandler(document, [](std::optional<Error>) {});
  manager = nullptr;
  advance(seconds(1));
  EXPECT_EQ(times("INFO", "Refreshing " + text(document)), 1u) << "the manager is gone";
}

TEST_F(PreviewFollowingTest, FollowsOnlyWhileTheApplicationIsInFront) {
  const auto manager = show();
  runAllQueues();
  resignActive();
  EXPECT_FALSE(manager->filePresenterRegistered());
  EXPECT_EQ(manager->batonActivity(), nullptr);
  EXPECT_FALSE(activities().back()->isCurrent());
  EXPECT_TRUE(logged("DEBUG", "Resigning active for " + text(document)));
  becomeActive();
  EXPECT_TRUE(manager->filePresenterRegistered());
  EXPECT_TRUE(logged("DEBUG", "Becoming active for " + text(document)));
}

TEST_F(PreviewFollowingTest, OtherDevicesAreToldOfTheDocument) {
  const auto manager = show();
  EXPECT_TRUE(activities().empty()) << "the bookmark comes later";
  runAllQueues();
  ASSERT_THAT(activities(), SizeIs(1));
  const auto& activity = *activities().front();
  EXPECT_EQ(activity.activityType(), "com.marrow.kestrel.viewing");
  EXPECT_TRUE(activity.isEligible());
  EXPECT_TRUE(activity.isCurrent());
  const Dictionary expected = {{UserActivityDocumentURLKey, bookmarkableString(document)}};
  EXPECT_EQ(activity.userInfo(), expected);
  EXPECT_EQ(manager->batonActivity(), activities().front());
}

TEST_F(PreviewFollowingTest, OfABookmarkOtherDevicesAreToldTheDocument) {
  const URL far = addFile("Plans/Far.pdf");
  const URL bookmark = addFile("Plans/Far.vaelobookmark");
  memory.disk.items.at(bookmark.path()).bookmarkTarget = far;
  const auto manager = makeManager();
  manager->previewItem(DRItem::initWithURL(bookmark));
  runAllQueues();
  const Dictionary expected = {{UserActivityDocumentURLKey, bookmarkableString(far)}};
  EXPECT_EQ(activities().back()->userInfo(), expected);
}

TEST_F(PreviewFollowingTest, EachActivationGivesANewActivity) {
  const auto manager = show();
  runAllQueues();
  becomeActive();
  runAllQueues();
  EXPECT_THAT(activities(), SizeIs(2)) << "also when the document was followed already";
  EXPECT_THAT(memory.coordination.presenters(), SizeIs(1));
  EXPECT_TRUE(activities().front()->isCurrent()) << "the new one takes its place without its resigning";
  resignActive();
  becomeActive();
  runAllQueues();
  EXPECT_THAT(activities(), SizeIs(3));
  EXPECT_EQ(manager->batonActivity(), activities().back());
}

TEST_F(PreviewFollowingTest, WithoutABookmarkThereIsNoActivity) {
  auto& answers = memory.provider.strings;
  const Error notInDrive{CloudDocumentsErrorDomain, 7, {}, {}, {}};
  const Error other{CloudDocumentsErrorDomain, 8, {}, {}, {}};
  const Error otherDomain{FileErrorDomain, 7, {}, {}, {}};
  const auto ask = [&](const Result<std::string>& answer) {
    answers.insert_or_assign(document.path(), answer);
    const auto manager = show();
    runAllQueues();
  };
  ask(notInDrive);
  EXPECT_TRUE(logged("INFO", "BookmarkableStringFromDocumentURL returned " + notInDrive.description()));
  ask(other);
  EXPECT_TRUE(logged("ERROR", "BookmarkableStringFromDocumentURL returned " + other.description()));
  ask(otherDomain);
  EXPECT_TRUE(logged("ERROR", "BookmarkableStringFromDocumentURL returned " + otherDomain.description()));
  ask(Result<std::string>());
  EXPECT_TRUE(logged("ERROR", "BookmarkableStringFromDocumentURL returned empty bookmark"));
  ask(Result<std::string>(""));
  EXPECT_TRUE(activities().empty());
}

TEST_F(PreviewFollowingTest, AnAnswerAfterTheManagerIsGoneIsNobodys) {
  memory.provider.holdsAnswers = true;
  auto manager = show();
  manager = nullptr;
  for (const Block& answer : memory.provider.held) answer();
  runAllQueues();
  EXPECT_TRUE(activities().empty());
}

TEST_F(PreviewFollowingTest, AnAnswerDoesNotKeepTheManager) {
  auto manager = show();
  const std::weak_ptr<PreviewItemManager> weak = manager;
  manager = nullptr;  // the answer is there, but not yet on the main queue
  EXPECT_TRUE(weak.expired());
  memory.provider.strings.insert_or_assign(document.path(), Result<std::string>());
  memory.provider.holdsAnswers = true;
  manager = show();
  manager = nullptr;
  for (const Block& answer : memory.provider.held) answer();
  runAllQueues();
  EXPECT_TRUE(activities().empty());
  EXPECT_FALSE(loggedStarting("ERROR", "BookmarkableStringFromDocumentURL")) << "nobody asks any more";
}

TEST_F(PreviewFollowingTest, AManagerThatGoesNoLongerFollowsNorOffers) {
  auto manager = show();
  runAllQueues();
  const auto activity = activities().back();
  manager = nullptr;
  EXPECT_TRUE(memory.coordination.presenters().empty());
  EXPECT_FALSE(activity->isCurrent());
}

TEST_F(PreviewFollowingTest, SaysWhatItPresents) {
  const auto manager = show();
  EXPECT_EQ(manager->presentedItemURL(), document);
  EXPECT_TRUE(logged("DEBUG", "presentedItemURL " + text(document)));
}

TEST_F(PreviewFollowingTest, NoticesDuringTheRefreshAreAbsorbedByIt) {
  setModified(document, seconds(10));
  const auto manager = show();
  memory.coordination.othersChanged(document);
  bool pending = false;
  const auto token = glimpse()->changed().connect([&](ViewController&, ViewControllerChange) {
    pending = manager->refreshPending();
    manager->presentedItemDidChange();
  });
  glimpse()->setTitle("old");
  pending = false;
  advance(seconds(1));
  EXPECT_TRUE(pending) << "until the refresh is over";
  EXPECT_FALSE(manager->refreshPending());
  advance(seconds(2));
  EXPECT_EQ(times("INFO", "Refreshing " + text(document)), 1u);
  EXPECT_FALSE(loggedStarting("ERROR", "UNEXPECTED: path changed")) << "it is where it was";
}

}  // namespace
}  // namespace vaelo
