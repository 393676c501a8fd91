// SPDX-License-Identifier: GPL-3.0-or-later
#include "app/app_delegate.h"

#include <gmock/gmock.h>

#include "app/main.h"
#include "app/settings.h"
#include "platform/archive.h"
#include "platform/ui/search_controller.h"
#include "tests/unit/app_fixture.h"

namespace vaelo {
namespace {

using ::testing::Contains;

class AppDelegateTest : public AppFixture {
 protected:
  bool launch(const LaunchOptions& options = {}) {
    delegate = std::make_shared<AppDelegate>();
    const bool result = delegate->applicationWillFinishLaunchingWithOptions(options);
    nav = std::dynamic_pointer_cast<NavController>(delegate->rootWindow()->rootViewController());
    return result;
  }
  std::string linkTo(const URL& url, const std::string& query = "") {
    return "vaelodriveapp:" + percentEncoded(percentEncoded(url.path())) + query;
  }
  bool open(const std::string& link) { return delegate->applicationOpenURLOptions(link, {}); }
  /// The mode in which the document of the link is shown; nothing when the link is refused.
  std::optional<long> modeOf(const std::string& query) {
    if (!open(linkTo(document, query))) return std::nullopt;
    return nav->itemManager()->mode();
  }
  bool continueActivity(const std::string& type, Dictionary userInfo = {}) {
    return delegate->applicationContinueUserActivityRestorationHandler(makeActivity(type, std::move(userInfo)),
                                                                       [] { ADD_FAILURE() << "never called"; });
  }
  void shortcut(const std::string& type, Dictionary userInfo = {}) {
    delegate->applicationPerformActionForShortcutItemCompletionHandler({type, std::move(userInfo)},
                                                                       [](bool) { ADD_FAILURE() << "never called"; });
  }
  std::optional<URL> shown() {
    return nav->itemManager() && nav->itemManager()->item() ? nav->itemManager()->item()->url() : std::nullopt;
  }
  std::shared_ptr<SearchController> search() {
    return std::dynamic_pointer_cast<SearchController>(nav->presentedViewController());
  }

  std::shared_ptr<AppDelegate> delegate;
  URL document = addFile("Plans/a.txt");
};

TEST_F(AppDelegateTest, MainLogsItselfAndRunsTheLoop) {
  char name[] = "/opt/vaelo-drive";
  char* arguments[] = {name, nullptr};
  EXPECT_EQ(vaeloMain(1, arguments), exitStatusOfLoop());
  EXPECT_TRUE(logged("DEBUG", std::string(55, '-')));
  EXPECT_TRUE(logged("INFO", "Running /opt/vaelo-drive"));
  EXPECT_TRUE(loggedStarting("INFO", "Built (main) on "));
}

TEST_F(AppDelegateTest, LaunchingShowsTheRootInAWhiteWindow) {
  EXPECT_TRUE(launch());
  EXPECT_TRUE(delegate->applicationDidFinishLaunchingWithOptions({}));
  ASSERT_NE(nav, nullptr);
  EXPECT_EQ(delegate->window(), delegate->rootWindow());
  EXPECT_TRUE(delegate->rootWindow()->visible());
  EXPECT_EQ(delegate->rootWindow()->backgroundColor(), Color::white());
  EXPECT_EQ(nav->restorationIdentifier(), "Root");
  EXPECT_TRUE(nav->isViewLoaded());
}

TEST_F(AppDelegateTest, LaunchingFromAShortcutActsOnItOnceAndReturnsFalse) {
  EXPECT_FALSE(launch({ShortcutItem{SearchShortcutType, {}}}));
  EXPECT_TRUE(logged("INFO", std::string("Launched with shortcut: ") + SearchShortcutType));
  EXPECT_EQ(log().count("INFO", "================= Firmpress: Search"), 1u);
  advance(std::chrono::milliseconds(700));
  ASSERT_NE(search(), nullptr);
  EXPECT_EQ(search()->query(), "");
}

TEST_F(AppDelegateTest, ALinkShowsItsDocument) {
  launch();
  EXPECT_TRUE(open(linkTo(document)));
  EXPECT_EQ(shown(), document);
  EXPECT_EQ(nav->itemManager()->mode(), 0);
  EXPECT_TRUE(logged("INFO", "================= AppDelegate: openURL"));
  EXPECT_THAT(userActions(), Contains("AppDelegate: openURL"));
}

TEST_F(AppDelegateTest, TheHostOfALinkIsNotLookedAt) {
  launch();
  EXPECT_TRUE(open("vaelodriveapp://somewhere" + document.path()));
  EXPECT_EQ(shown(), document);
}

TEST_F(AppDelegateTest, ALinkIsDecodedTwice) {
  const URL percent = addFile("Plans/100%.txt");
  launch();
  EXPECT_TRUE(open("vaelodriveapp:" + percent.deletingLastPathComponent().path() + "/100%2525.txt"));
  EXPECT_EQ(shown(), percent);
  EXPECT_FALSE(open("vaelodriveapp:" + percent.deletingLastPathComponent().path() + "/100%25.txt"))
      << "a percent sign encoded only once";
}

TEST_F(AppDelegateTest, TheLastKnownModeOfALinkWins) {
  launch();
  EXPECT_EQ(modeOf(""), 0);
  EXPECT_EQ(modeOf("?mode=preview"), 0);
  EXPECT_EQ(modeOf("?mode=details"), 1);
  EXPECT_EQ(modeOf("?mode=info"), 1);
  EXPECT_EQ(modeOf("?mode=info&mode=preview"), 0);
  EXPECT_EQ(modeOf("?mode=preview&mode=info"), 1);
  EXPECT_EQ(modeOf("?mode=info&mode=other"), 1);
  EXPECT_EQ(modeOf("?mode=info&mode"), 1);
  EXPECT_EQ(modeOf("?Mode=info"), 0);
  EXPECT_EQ(modeOf("?mo%2564e=in%2566o"), 1) << "names and values are decoded twice";
  EXPECT_EQ(modeOf("?note=100%25&mode=info"), 1) << "what is not ours need not decode";
}

TEST_F(AppDelegateTest, ForeignAndBrokenLinksAreRefused) {
  launch();
  EXPECT_FALSE(open("VaeloDriveApp:" + document.path()));
  EXPECT_FALSE(open("other:" + document.path()));
  EXPECT_FALSE(open("vaelodriveapp:/%zz"));
  EXPECT_FALSE(open("vaelodriveapp:relative/path"));
  EXPECT_FALSE(open("vaelodriveapp:"));
  EXPECT_FALSE(open(""));
  EXPECT_FALSE(open("vaelodriveapp:/etc/passwd"));
  EXPECT_EQ(nav->viewControllers().size(), 1u);
}

TEST_F(AppDelegateTest, EveryRouteNeedsTheNavController) {
  launch();
  delegate->rootWindow()->setRootViewController(std::make_shared<ViewController>());
  EXPECT_FALSE(open(linkTo(document)));
  EXPECT_FALSE(delegate->applicationShouldSaveApplicationState());
  shortcut(SearchShortcutType);
  EXPECT_TRUE(continueActivity(SearchContinuationActivityType, {{SearchQueryStringKey, "x"}}));
  runAllQueues();
}

TEST_F(AppDelegateTest, ARecentDocumentIsFoundByItsAliasFirst) {
  const URL other = addFile("Plans/b.txt");
  giveDocumentID(other, 77);
  launch();
  shortcut(RecentDocumentShortcutType,
           {{RecentDocumentAliasURLKey, archiveURL(document)}, {RecentDocumentDocIDKey, std::uint64_t{77}}});
  EXPECT_EQ(shown(), document);
  EXPECT_TRUE(logged("INFO", "Shortcut recent document: " + document.absoluteString()));
  EXPECT_TRUE(logged("INFO", "================= Firmpress: Recent Document"));
}

TEST_F(AppDelegateTest, ARecentDocumentIsFoundByItsIdentifierThenByItsURL) {
  const URL other = addFile("Plans/b.txt");
  giveDocumentID(other, 77);
  launch();
  shortcut(RecentDocumentShortcutType, {{RecentDocumentAliasURLKey, Data{9, 9}},
                                        {RecentDocumentDocIDKey, std::uint64_t{77}},
                                        {RecentDocumentURLKey, archiveURL(document)}});
  EXPECT_EQ(shown(), other);
  shortcut(RecentDocumentShortcutType, {{RecentDocumentDocIDKey, "77"}, {RecentDocumentURLKey, archiveURL(document)}});
  EXPECT_EQ(shown(), document) << "the identifier is no number";
}

TEST_F(AppDelegateTest, AShortcutThatLeadsNowhereDoesNothing) {
  launch();
  shortcut(RecentDocumentShortcutType);
  shortcut("another.type", {{RecentDocumentURLKey, archiveURL(document)}});
  EXPECT_EQ(nav->viewControllers().size(), 1u);
  EXPECT_TRUE(logged("INFO", "Shortcut action: another.type"));
}

TEST_F(AppDelegateTest, ASearchIsContinued) {
  launch();
  EXPECT_TRUE(continueActivity(SearchContinuationActivityType, {{SearchQueryStringKey, "needle"}}));
  EXPECT_TRUE(logged("INFO", "Quarry Search Continuation: \"needle\""));
  EXPECT_TRUE(logged("INFO", "================= Quarry: Search Continuation"));
  advance(std::chrono::milliseconds(700));
  ASSERT_NE(search(), nullptr);
  EXPECT_EQ(search()->query(), "needle");
}

TEST_F(AppDelegateTest, ASearchWithoutAQueryCountsAsContinued) {
  launch();
  EXPECT_TRUE(continueActivity(SearchContinuationActivityType));
  advance(std::chrono::seconds(1));
  EXPECT_EQ(search(), nullptr);
}

TEST_F(AppDelegateTest, ASearchResultIsShownSoon) {
  giveDocumentID(document, 42);
  launch();
  EXPECT_TRUE(continueActivity(SearchResultActivityType, {{SearchResultIdentifierKey, "42"}}));
  EXPECT_EQ(shown(), std::nullopt);
  runMainQueue();
  EXPECT_EQ(shown(), document);
  EXPECT_TRUE(logged("INFO", "Quarry Search Result: open documentID \"42\""));
  EXPECT_TRUE(logged("INFO", "Quarry documentID 42 is URL: " + document.absoluteString()));
}

TEST_F(AppDelegateTest, ASearchResultThatIsNotDownloadedIsNamedAsItWillBe) {
  const URL coming = addPromise("Plans/Coming.pdf");
  for (auto& [path, item] : memory.disk.items) {
    if (path.find("Coming.pdf") != std::string::npos) item.documentID = 43;
  }
  launch();
  EXPECT_TRUE(continueActivity(SearchResultActivityType, {{SearchResultIdentifierKey, "43"}}));
  runMainQueue();
  EXPECT_TRUE(logged("INFO", "Quarry documentID 43 is URL: " + coming.absoluteString()));
  EXPECT_EQ(shown(), coming);
}

TEST_F(AppDelegateTest, AnUnknownSearchResultIsLogged) {
  launch();
  EXPECT_TRUE(continueActivity(SearchResultActivityType, {{SearchResultIdentifierKey, "4711"}}));
  runMainQueue();
  EXPECT_EQ(shown(), std::nullopt);
  EXPECT_TRUE(logged("ERROR", "Can't get URL for DocumentID: 4711"));
}

TEST_F(AppDelegateTest, ABatonDocumentIsShownSoon) {
  const std::string bookmark = bookmarkableString(document);
  launch();
  EXPECT_TRUE(continueActivity(Settings::batonVaeloActivityType(), {{UserActivityDocumentURLKey, bookmark}}));
  runAllQueues();
  EXPECT_EQ(shown(), document);
  EXPECT_TRUE(logged("INFO", "================= Baton: Open Document"));
  EXPECT_TRUE(logged("INFO", "Baton document bookmark: " + bookmark));
  EXPECT_TRUE(logged("INFO", "Baton document URL: " + document.absoluteString()));
}

TEST_F(AppDelegateTest, ABatonBookmarkThatCannotBeDecodedIsLogged) {
  launch();
  EXPECT_TRUE(continueActivity(Settings::batonVaeloActivityType(), {{UserActivityDocumentURLKey, "?"}}));
  runAllQueues();
  EXPECT_EQ(shown(), std::nullopt);
  EXPECT_TRUE(loggedStarting("ERROR", "Baton failed to decode bookmark: "));
}

TEST_F(AppDelegateTest, AnUnknownActivityIsRefused) {
  launch();
  EXPECT_FALSE(continueActivity("another.type"));
  EXPECT_TRUE(logged("ERROR", "Invalid user activity type another.type"));
  EXPECT_TRUE(delegate->applicationWillContinueUserActivityWithType("t"));
  EXPECT_TRUE(logged("INFO", "applicationWillContinueUserActivityWithType: activity type is t"));
  const Error error{FileErrorDomain, 4, {}, "no", {}};
  delegate->applicationDidFailToContinueUserActivityWithTypeError("t", error);
  EXPECT_TRUE(logged(
      "ERROR", "applicationDidFailToContinueUserActivityWithTypeError: activity type is t: Error " + error.description()));
}

TEST_F(AppDelegateTest, StateIsKeptOnlyWhileSomeoneIsSignedIn) {
  launch();
  EXPECT_TRUE(delegate->applicationShouldSaveApplicationState());
  EXPECT_TRUE(delegate->applicationShouldRestoreApplicationState());
  signOut();
  EXPECT_FALSE(delegate->applicationShouldSaveApplicationState());
  EXPECT_FALSE(delegate->applicationShouldRestoreApplicationState());
}

TEST_F(AppDelegateTest, ThereIsNoPerformanceHarness) {
  launch();
  delegate->applicationWillResignActive();
  EXPECT_FALSE(delegate->applicationRunTestOptions("ScrollThumbnails", {}));
  EXPECT_EQ(nav->viewControllers().size(), 1u);
}

TEST_F(AppDelegateTest, SettingsAreFixed) {
  EXPECT_TRUE(Settings::quickLaunch());
  EXPECT_STREQ(Settings::batonVaeloActivityType(), "com.marrow.kestrel.viewing");
}

}  // namespace
}  // namespace vaelo
