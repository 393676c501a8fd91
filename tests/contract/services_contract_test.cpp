// SPDX-License-Identifier: GPL-3.0-or-later
#include "tests/contract/contract_test.h"

namespace vaelo::contract {
namespace {

using Names = std::vector<std::string>;

/// Preferences, activities, progress, applications, notices.
class ServicesContract : public ContractTest {
 protected:
  /// Follows a document's progress and writes down what it hears.
  std::shared_ptr<void> follow(const URL& url) {
    return platform->progress().subscribe(url, [this](std::shared_ptr<Progress> progress) -> FileProgress::Withdrawn {
      heard.push_back("published " + progress->kind());
      note(*progress);
      observation = progress->observe("fractionCompleted", [this, weak = std::weak_ptr(progress)](const std::string& key) {
        EXPECT_EQ(key, "fractionCompleted");
        if (const auto changed = weak.lock()) note(*changed);
      });
      return [this] { heard.push_back("withdrawn"); };
    });
  }
  void note(const Progress& progress) {
    heard.push_back(std::to_string(progress.completedUnits()) + "/" + std::to_string(progress.totalUnits()));
  }
  bool untilHeard(const std::string& what) {
    return platform->until([&] { return !heard.empty() && heard.back() == what; });
  }

  Names heard;
  std::shared_ptr<void> observation;
};

VAELO_CONTRACT_SUITE(ServicesContract);

TEST_P(ServicesContract, PreferencesAreKept) {
  const Data bytes{0, 1, 255, 10, 61};
  EXPECT_FALSE(platform->preferences().dataForKey("key"));
  platform->preferences().setDataForKey("key", bytes);
  EXPECT_EQ(platform->preferences().dataForKey("key"), bytes);
  EXPECT_EQ(platform->preferencesAfterRestart().dataForKey("key"), bytes);
  platform->preferences().setDataForKey("key", Data{});
  EXPECT_EQ(platform->preferencesAfterRestart().dataForKey("key"), Data{}) << "nothing is not absence";
}

TEST_P(ServicesContract, PreferencesThatAreRemovedStayAway) {
  platform->preferences().setDataForKey("a", Data{1});
  platform->preferences().setDataForKey("b", Data{2});
  platform->preferences().removeKey("a");
  platform->preferences().removeKey("never there");
  EXPECT_FALSE(platform->preferences().dataForKey("a"));
  EXPECT_FALSE(platform->preferencesAfterRestart().dataForKey("a"));
  EXPECT_EQ(platform->preferences().dataForKey("b"), Data{2});
}

TEST_P(ServicesContract, AnyTextIsAKey) {
  const Names keys{"a=b", "[group]", "with blank", "ünï", "line\nbreak", "100%", "A", "a"};
  for (std::size_t i = 0; i < keys.size(); ++i) {
    platform->preferences().setDataForKey(keys[i], Data{static_cast<std::uint8_t>(i)});
  }
  Preferences& again = platform->preferencesAfterRestart();
  for (std::size_t i = 0; i < keys.size(); ++i) {
    EXPECT_EQ(again.dataForKey(keys[i]), Data{static_cast<std::uint8_t>(i)}) << keys[i];
  }
}

TEST_P(ServicesContract, AnActivityIsWhatWasSaidOfIt) {
  const auto activity = platform->activities().makeActivity("com.example.viewing");
  ASSERT_TRUE(activity);
  EXPECT_EQ(activity->activityType(), "com.example.viewing");
  EXPECT_TRUE(activity->userInfo().empty());
  const Dictionary info{{"text", "x"}, {"number", std::int64_t{5}}, {"url", outside("a")}};
  activity->setUserInfo(info);
  EXPECT_EQ(activity->userInfo(), info);
  activity->setEligibleForBaton(true);
  activity->becomeCurrent();
  activity->becomeCurrent();
  const auto other = platform->activities().makeActivity("com.example.other");
  other->becomeCurrent();
  activity->resignCurrent();
  activity->resignCurrent();
  EXPECT_EQ(activity->userInfo(), info);
  EXPECT_TRUE(other->userInfo().empty());
}

TEST_P(ServicesContract, ProgressIsPublishedChangedAndWithdrawn) {
  platform->addPromise(inDrive("far").path(), PromiseFacts{1000, {}, {}, false, {}, {}});
  const auto subscription = follow(inDrive("far"));
  EXPECT_TRUE(heard.empty()) << "never within the call";
  platform->transfer(inDrive("far").path(), 200, 1000);
  ASSERT_TRUE(untilHeard("200/1000"));
  EXPECT_EQ(heard.front(), std::string("published ") + FileProgressKind);
  platform->transfer(inDrive("far").path(), 700, 1000);
  ASSERT_TRUE(untilHeard("700/1000"));
  platform->transfer(inDrive("far").path(), 1000, 1000);
  ASSERT_TRUE(untilHeard("withdrawn"));
  EXPECT_EQ(heard[heard.size() - 2], "1000/1000");
  EXPECT_EQ(std::count(heard.begin(), heard.end(), heard.front()), 1);
}

TEST_P(ServicesContract, WhoStopsFollowingHearsNoMore) {
  platform->addPromise(inDrive("far").path(), PromiseFacts{1000, {}, {}, false, {}, {}});
  auto subscription = follow(inDrive("far"));
  platform->transfer(inDrive("far").path(), 200, 1000);
  ASSERT_TRUE(untilHeard("200/1000"));
  subscription = nullptr;
  observation = nullptr;
  const Names before = heard;
  Names others;
  const auto other = platform->progress().subscribe(inDrive("far"), [&](std::shared_ptr<Progress> progress) {
    others.push_back(std::to_string(progress->completedUnits()));
    return FileProgress::Withdrawn([&] { others.push_back("withdrawn"); });
  });
  platform->transfer(inDrive("far").path(), 1000, 1000);
  platform->until([&] { return !others.empty() && others.back() == "withdrawn"; });
  EXPECT_EQ(heard, before);
}

TEST_P(ServicesContract, ProgressIsOfOneDocument) {
  platform->addPromise(inDrive("far").path(), PromiseFacts{10, {}, {}, false, {}, {}});
  platform->addPromise(inDrive("far2").path(), PromiseFacts{10, {}, {}, false, {}, {}});
  Names others;
  const auto other = platform->progress().subscribe(inDrive("far2"), [&](std::shared_ptr<Progress>) {
    others.push_back("published");
    return FileProgress::Withdrawn();
  });
  const auto subscription = follow(inDrive("far"));
  platform->transfer(inDrive("far").path(), 5, 10);
  ASSERT_TRUE(untilHeard("5/10"));
  EXPECT_TRUE(others.empty());
}

TEST_P(ServicesContract, ADocumentOfNoApplicationHasNoOwners) {
  platform->addFile(inDrive("a.nosuchext").path());
  const auto record = platform->launch().documentRecord(inDrive("a.nosuchext"), false);
  ASSERT_TRUE(record);
  EXPECT_EQ(record->url(), inDrive("a.nosuchext"));
  EXPECT_FALSE(record->applicationsAvailableForOpeningByHandlerRank().error);
  EXPECT_FALSE(platform->launch().applicationRecord("org.example.NoSuchApplication"));
  EXPECT_EQ(platform->launch().ownBundleIdentifier(), "com.marrow.VaeloDrive");
}

TEST_P(ServicesContract, NoticesGoToThoseWhoObserveTheirName) {
  Names seen;
  auto first = platform->notifications().addObserver("a", [&](const Notification& notice) {
    seen.push_back("first " + notice.name + " " + notice.userInfo.at("key").description());
  });
  const auto second = platform->notifications().addObserver("a", [&](const Notification&) { seen.push_back("second"); });
  const auto other = platform->notifications().addObserver("b", [&](const Notification&) { seen.push_back("other"); });
  platform->notifications().post({"a", {{"key", "value"}}});
  EXPECT_EQ(seen, (Names{"first a value", "second"}));
  first = nullptr;
  platform->notifications().post({"a", {}});
  EXPECT_EQ(seen.back(), "second");
  EXPECT_EQ(seen.size(), 3u);
}

}  // namespace
}  // namespace vaelo::contract
