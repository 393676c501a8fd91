// SPDX-License-Identifier: GPL-3.0-or-later
#include <gmock/gmock.h>

#include "app/settings.h"
#include "platform/archive.h"
#include "platform/ui/search_controller.h"
#include "platform/url_components.h"
#include "tests/unit/nav_review_fixture.h"

namespace vaelo {
namespace {

using ::testing::ElementsAre;

/// Every way in: what it says, what it needs, and where it ends.
class AppReviewEntryTest : public NavReviewTest {
 protected:
  bool open(const std::string& link) { return delegate->applicationOpenURLOptions(link, {}); }
  std::shared_ptr<SearchController> search() {
    return std::dynamic_pointer_cast<SearchController>(nav->presentedViewController());
  }
  /// Leaves a details screen, so that a way in has a mode to change.
  void showDetails() {
    nav->warpToNewURLPreviewMode(other, 1);
    ASSERT_EQ(nav->itemManager()->mode(), 1);
  }
};

// The launch.

TEST_F(AppReviewEntryTest, theStackIsBuiltWhenTheWindowFirstShowsIt) {
  EXPECT_FALSE(std::make_shared<NavController>()->isViewLoaded());
  EXPECT_FALSE(launch({ShortcutItem{"another.type", {}}}));
  EXPECT_LT(lineOf("Vaelo is enabled"), lineOf("Launched with shortcut: another.type"));
  EXPECT_EQ(countOf("Vaelo is enabled"), 1u);
  EXPECT_EQ(nav->viewControllers().size(), 1u);
}

TEST_F(AppReviewEntryTest, aTabletGetsItsRootToo) {
  makeTablet();
  EXPECT_TRUE(launch());
  ASSERT_NE(nav, nullptr);
  EXPECT_EQ(nav->restorationIdentifier(), "Root");
}

TEST_F(AppReviewEntryTest, aLaunchWithoutAShortcutSaysNothingOfOne) {
  launch();
  EXPECT_EQ(countOf("shortcut"), 0u);
  EXPECT_TRUE(userActions().empty());
}

TEST_F(AppReviewEntryTest, beforeTheLaunchNoRouteLeadsAnywhere) {
  delegate = std::make_shared<AppDelegate>();
  EXPECT_EQ(delegate->rootWindow(), nullptr);
  EXPECT_FALSE(open("vaelodriveapp:" + document.path()));
  recentDocument({{RecentDocumentURLKey, archiveURL(document)}});
  EXPECT_TRUE(continueActivity(SearchContinuationActivityType, {{SearchQueryStringKey, "x"}}));
  runAllQueues();
  EXPECT_FALSE(delegate->applicationShouldSaveApplicationState());
  EXPECT_FALSE(delegate->applicationShouldRestoreApplicationState());
}

TEST_F(AppReviewEntryTest, leavingTheFrontDoesNothing) {
  launch();
  log().clear();
  delegate->applicationWillResignActive();
  EXPECT_TRUE(log().lines().empty());
}

// Links.

TEST_F(AppReviewEntryTest, onlyThePathAndTheModeOfALinkAreLookedAt) {
  launch();
  EXPECT_TRUE(open("vaelodriveapp://user@elsewhere:80" + document.path() + "?a=b&mode=info#part"));
  EXPECT_EQ(previewed(), document);
  EXPECT_EQ(nav->itemManager()->mode(), 1);
}

TEST_F(AppReviewEntryTest, modesAreKnownByTheirExactNames) {
  launch();
  for (const char* query : {"?mode=Info", "?mode=detail", "?mode=1", "?mode=", "?mode", "?modes=info", "?info"}) {
    EXPECT_TRUE(open("vaelodriveapp:" + document.path() + query));
    EXPECT_EQ(nav->itemManager()->mode(), 0) << query;
  }
  EXPECT_TRUE(open("vaelodriveapp:" + document.path() + "?mode=details&mode=previews"));
  EXPECT_EQ(nav->itemManager()->mode(), 1);
  EXPECT_FALSE(open("vaelodriveapp:" + document.path() + "?mode=%zz")) << "no URL at all";
}

TEST_F(AppReviewEntryTest, aColonBehindASlashIsNoEndOfAScheme) {
  const auto parts = URLComponents::parse("/a:b");
  ASSERT_TRUE(parts);
  EXPECT_EQ(parts->scheme, "");
  EXPECT_EQ(parts->path, "/a:b");
  EXPECT_FALSE(URLComponents::parse(":/a"));
}

TEST_F(AppReviewEntryTest, aLinkThatLeadsNowhereInTheDriveIsRefusedByTheWarp) {
  launch();
  presentSomething();
  EXPECT_FALSE(open("vaelodriveapp:/drive/mirror/com~marrow~Kestrel/no/such.txt"));
  EXPECT_EQ(nav->presentedViewController(), nullptr);
  EXPECT_TRUE(loggedStarting("WARNING", "warpToNewURL failed: "));
}

TEST_F(AppReviewEntryTest, everyLinkIsAnActionOfTheUser) {
  launch();
  open("other:");
  EXPECT_THAT(userActions(), ElementsAre("AppDelegate: openURL"));
  EXPECT_LT(lineOf("================= AppDelegate: openURL"), lineOf("openURL: other:"));
}

// Shortcuts.

TEST_F(AppReviewEntryTest, aSearchShortcutOpensAnEmptySearch) {
  launch();
  showDetails();
  delegate->applicationPerformActionForShortcutItemCompletionHandler({SearchShortcutType, {}},
                                                                     [](bool) { ADD_FAILURE() << "never called"; });
  EXPECT_THAT(userActions(), ElementsAre("Firmpress: Search"));
  EXPECT_LT(lineOf(std::string("Shortcut action: ") + SearchShortcutType), lineOf("================= Firmpress: Search"));
  advance(std::chrono::milliseconds(700));
  ASSERT_NE(search(), nullptr);
  EXPECT_EQ(search()->query(), "");
  EXPECT_EQ(nav->viewControllers().size(), 1u);
}

TEST_F(AppReviewEntryTest, aRecentDocumentIsPreviewedWhateverWasShown) {
  launch();
  showDetails();
  recentDocument({{RecentDocumentAliasURLKey, archiveURL(document)}});
  EXPECT_EQ(previewed(), document);
  EXPECT_EQ(nav->itemManager()->mode(), 0);
  EXPECT_THAT(userActions(), ElementsAre("Firmpress: Recent Document"));
  EXPECT_LT(lineOf("================= Firmpress: Recent Document"), lineOf("Shortcut recent document: "));
}

TEST_F(AppReviewEntryTest, anIdentifierOfAnyNumberTypeFindsItsDocument) {
  giveDocumentID(document, 77);
  launch();
  for (const Value& identifier : {Value(std::uint64_t{77}), Value(std::int64_t{77}), Value(77.0)}) {
    nav->warpToNewURLPreviewMode(other, 0);
    recentDocument({{RecentDocumentDocIDKey, identifier}, {RecentDocumentURLKey, archiveURL(other)}});
    EXPECT_EQ(previewed(), document) << identifier.description();
  }
}

TEST_F(AppReviewEntryTest, anAliasThatIsNoArchiveFallsBack) {
  giveDocumentID(document, 77);
  launch();
  recentDocument({{RecentDocumentAliasURLKey, archiveURL(other).size() > 0 ? Value("text") : Value()},
                  {RecentDocumentDocIDKey, std::uint64_t{77}}});
  EXPECT_EQ(previewed(), document);
}

TEST_F(AppReviewEntryTest, anIdentifierThatIsNoNumberIsNotLookedUp) {
  launch();
  recentDocument({{RecentDocumentDocIDKey, "77"}, {RecentDocumentURLKey, archiveURL(document)}});
  EXPECT_EQ(previewed(), document);
  EXPECT_EQ(countOf("TBLibraryResolveDocumentId2 failed"), 0u);
}

// Continued activities.

TEST_F(AppReviewEntryTest, aContinuedSearchForNothingOpensAnEmptySearch) {
  launch();
  EXPECT_TRUE(continueActivity(SearchContinuationActivityType, {{SearchQueryStringKey, ""}}));
  EXPECT_THAT(userActions(), ElementsAre("Quarry: Search Continuation"));
  EXPECT_LT(lineOf("================= Quarry: Search Continuation"), lineOf("Quarry Search Continuation: \"\""));
  advance(std::chrono::milliseconds(700));
  ASSERT_NE(search(), nullptr);
  EXPECT_EQ(search()->query(), "");
}

TEST_F(AppReviewEntryTest, aSearchResultIsPreviewedWhateverWasShown) {
  giveDocumentID(document, 42);
  launch();
  showDetails();
  continueActivity(SearchResultActivityType, {{SearchResultIdentifierKey, "42"}});
  EXPECT_THAT(userActions(), ElementsAre("Quarry: Open Search Result"));
  runMainQueue();
  EXPECT_EQ(previewed(), document);
  EXPECT_EQ(nav->itemManager()->mode(), 0);
}

TEST_F(AppReviewEntryTest, aSearchResultThatIsUnknownLeavesWhatIsPresented) {
  launch();
  presentSomething();
  EXPECT_TRUE(continueActivity(SearchResultActivityType, {{SearchResultIdentifierKey, "4711"}}));
  runMainQueue();
  EXPECT_NE(nav->presentedViewController(), nullptr);
  EXPECT_EQ(countOf("Quarry documentID"), 0u);
}

TEST_F(AppReviewEntryTest, aContinuedDocumentIsPreviewedWhateverWasShown) {
  launch();
  showDetails();
  const std::string bookmark = bookmarkableString(document);
  continueActivity(Settings::batonVaeloActivityType(), {{UserActivityDocumentURLKey, bookmark}});
  EXPECT_THAT(userActions(), ElementsAre("Baton: Open Document"));
  EXPECT_LT(lineOf("================= Baton: Open Document"), lineOf("Baton document bookmark: " + bookmark));
  runMainQueue();
  EXPECT_EQ(previewed(), document);
  EXPECT_EQ(nav->itemManager()->mode(), 0);
}

TEST_F(AppReviewEntryTest, aContinuedDocumentWithoutABookmarkIsAnError) {
  memory.provider.answersAtOnce = false;
  launch();
  presentSomething();
  EXPECT_TRUE(continueActivity(Settings::batonVaeloActivityType()));
  runAllQueues();
  EXPECT_TRUE(logged("INFO", "Baton document bookmark: (null)"));
  EXPECT_TRUE(loggedStarting("ERROR", "Baton failed to decode bookmark: "));
  EXPECT_NE(nav->presentedViewController(), nullptr);
}

TEST_F(AppReviewEntryTest, anUnknownActivityIsNoActionOfTheUser) {
  launch();
  EXPECT_FALSE(continueActivity("another.type"));
  EXPECT_TRUE(userActions().empty());
}

}  // namespace
}  // namespace vaelo
