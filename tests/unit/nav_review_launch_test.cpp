// SPDX-License-Identifier: GPL-3.0-or-later
#include "app/main.h"
#include "app/settings.h"
#include "platform/archive.h"
#include "tests/unit/nav_review_fixture.h"

/// The corners of the start and of the ways in.
namespace vaelo {
namespace {

using NavReviewLaunchTest = NavReviewTest;

TEST_F(NavReviewLaunchTest, TheProgramLogsItsOwnFile) {
  addOutsideFile("/opt/vaelo-drive");
  char name[] = "/opt/vaelo-drive";
  char* arguments[] = {name, nullptr};
  vaeloMain(1, arguments);
  EXPECT_TRUE(loggedStarting("DEBUG", "Size: "));
  EXPECT_LT(lineOf(std::string(55, '-')), lineOf("Running "));
  EXPECT_LT(lineOf("Running "), lineOf("Built (main) on "));
  EXPECT_LT(lineOf("Built (main) on "), lineOf("Size: "));
}

TEST_F(NavReviewLaunchTest, TheWindowFillsTheMainScreen) {
  launch();
  EXPECT_EQ(delegate->rootWindow()->bounds(), platform().screens.device().mainScreen().bounds);
}

TEST_F(NavReviewLaunchTest, LaunchingFromARecentDocumentShowsIt) {
  EXPECT_FALSE(launch({ShortcutItem{RecentDocumentShortcutType, {{RecentDocumentURLKey, archiveURL(document)}}}}));
  EXPECT_EQ(previewed(), document);
  EXPECT_EQ(log().count("INFO", std::string("Shortcut action: ") + RecentDocumentShortcutType), 1u);
  EXPECT_LT(lineOf("Launched with shortcut: "), lineOf("Shortcut action: "));
}

TEST_F(NavReviewLaunchTest, ALinkIsLoggedWithItsOptionsAndOurselves) {
  launch();
  const Dictionary options = {{"source", "elsewhere"}};
  delegate->applicationOpenURLOptions("other:/x", options);
  EXPECT_TRUE(logged("INFO", "openURL: other:/x, options " + Value(options).description() + ", app " +
                                 platform().application.description()));
}

TEST_F(NavReviewLaunchTest, ARefusedLinkIsLoggedAndLeavesWhatIsPresented) {
  launch();
  presentSomething();
  EXPECT_FALSE(delegate->applicationOpenURLOptions("other:" + document.path(), {}));
  EXPECT_FALSE(delegate->applicationOpenURLOptions("vaelodriveapp:/%25zz", {}));
  EXPECT_FALSE(delegate->applicationOpenURLOptions("vaelodriveapp:relative/path", {}));
  EXPECT_NE(nav->presentedViewController(), nullptr);
  EXPECT_EQ(log().count("WARNING", "openURL: refused, not a link of this application"), 1u);
  EXPECT_EQ(log().count("WARNING", "openURL: refused, no absolute path"), 2u);
}

TEST_F(NavReviewLaunchTest, ALinkToABookmarkShowsItsDocument) {
  const URL bookmark = addFile("Plans/away.vaelobookmark");
  cloud.bookmarks.emplace(bookmark.path(), document);
  launch();
  EXPECT_TRUE(delegate->applicationOpenURLOptions("vaelodriveapp:" + bookmark.path() + "?mode=info", {}));
  EXPECT_EQ(previewed(), document);
  EXPECT_EQ(nav->itemManager()->mode(), 1);
}

TEST_F(NavReviewLaunchTest, ALinkToABookmarkOfNothingIsRefusedByTheWarp) {
  const URL bookmark = addFile("Plans/away.vaelobookmark");
  cloud.bookmarks.emplace(bookmark.path(), Error{FileErrorDomain, FileErrorCode::NoSuchFile, {}, "gone", {}});
  launch();
  presentSomething();
  EXPECT_FALSE(delegate->applicationOpenURLOptions("vaelodriveapp:" + bookmark.path(), {}));
  EXPECT_EQ(nav->presentedViewController(), nullptr);
  EXPECT_EQ(nav->viewControllers().size(), 1u);
}

TEST_F(NavReviewLaunchTest, EveryOtherRouteNeedsTheNavControllerToo) {
  giveDocumentID(document, 42);
  launch();
  const auto root = std::make_shared<ViewController>();
  delegate->rootWindow()->setRootViewController(root);
  recentDocument({{RecentDocumentURLKey, archiveURL(document)}});
  EXPECT_TRUE(continueActivity(SearchResultActivityType, {{SearchResultIdentifierKey, "42"}}));
  EXPECT_TRUE(
      continueActivity(Settings::batonVaeloActivityType(), {{UserActivityDocumentURLKey, bookmarkableString(document)}}));
  runAllQueues();
  EXPECT_TRUE(logged("INFO", "Shortcut recent document: " + document.absoluteString()));
  EXPECT_TRUE(logged("INFO", "Baton document URL: " + document.absoluteString()));
  EXPECT_EQ(nav->itemManager(), nullptr);
  EXPECT_FALSE(delegate->applicationShouldRestoreApplicationState());
}

TEST_F(NavReviewLaunchTest, ARecentDocumentWhoseIdentifierIsUnknownIsFoundByItsURL) {
  launch();
  recentDocument({{RecentDocumentDocIDKey, std::uint64_t{4711}}, {RecentDocumentURLKey, archiveURL(document)}});
  EXPECT_EQ(previewed(), document);
}

TEST_F(NavReviewLaunchTest, ARecentDocumentThatCannotBeFoundLeavesWhatIsPresented) {
  launch();
  presentSomething();
  recentDocument({{RecentDocumentAliasURLKey, Data{1}}, {RecentDocumentURLKey, Data{2}}});
  recentDocument({{RecentDocumentURLKey, document}});
  EXPECT_NE(nav->presentedViewController(), nullptr);
  EXPECT_FALSE(loggedStarting("INFO", "Shortcut recent document: "));
}

TEST_F(NavReviewLaunchTest, AContinuedSearchIsNothingWithoutText) {
  launch();
  presentSomething();
  EXPECT_TRUE(continueActivity(SearchContinuationActivityType, {{SearchQueryStringKey, std::int64_t{5}}}));
  EXPECT_NE(nav->presentedViewController(), nullptr) << "no search was started";
  EXPECT_TRUE(logged("INFO", "Quarry Search Continuation: \"(null)\""));
}

TEST_F(NavReviewLaunchTest, ASearchResultWithoutAnIdentifierIsAnError) {
  launch();
  EXPECT_TRUE(continueActivity(SearchResultActivityType));
  EXPECT_TRUE(logged("INFO", "================= Quarry: Open Search Result"));
  EXPECT_TRUE(logged("ERROR", "Can't get URL for DocumentID: (null)"));
}

TEST_F(NavReviewLaunchTest, ASearchResultThatIsNotDownloadedIsShownByItsLogicalURL) {
  const URL logical = addPromise("Plans/c.txt");
  giveDocumentID(logical, 43);
  launch();
  EXPECT_TRUE(continueActivity(SearchResultActivityType, {{SearchResultIdentifierKey, "43"}}));
  runMainQueue();
  EXPECT_EQ(previewed(), logical);
  EXPECT_TRUE(logged("INFO", "Quarry documentID 43 is URL: " + logical.absoluteString()));
}

TEST_F(NavReviewLaunchTest, ABatonDocumentIsShownOnTheMainQueueNotWhereItIsDecoded) {
  launch();
  EXPECT_TRUE(
      continueActivity(Settings::batonVaeloActivityType(), {{UserActivityDocumentURLKey, bookmarkableString(document)}}));
  EXPECT_TRUE(logged("INFO", "Baton document URL: " + document.absoluteString()));
  EXPECT_EQ(previewed(), std::nullopt);
  runMainQueue();
  EXPECT_EQ(previewed(), document);
}

TEST_F(NavReviewLaunchTest, DecodingABatonBookmarkDoesNotKeepTheDelegate) {
  memory.provider.answersAtOnce = false;
  const std::string bookmark = bookmarkableString(document);
  for (const std::string& text : {bookmark, std::string("?")}) {
    launch();
    EXPECT_TRUE(continueActivity(Settings::batonVaeloActivityType(), {{UserActivityDocumentURLKey, text}}));
    const std::weak_ptr<AppDelegate> weak = delegate;
    delegate = nullptr;
    EXPECT_TRUE(weak.expired());
    runAllQueues();
    EXPECT_EQ(previewed(), std::nullopt);
  }
  EXPECT_FALSE(loggedStarting("INFO", "Baton document URL: "));
  EXPECT_TRUE(loggedStarting("ERROR", "Baton failed to decode bookmark: "));
}

}  // namespace
}  // namespace vaelo
