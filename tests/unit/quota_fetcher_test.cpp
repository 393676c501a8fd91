// SPDX-License-Identifier: GPL-3.0-or-later
// The polling of the account's free bytes: when it asks, on which queue, and whom it tells.
#include <gmock/gmock.h>

#include <limits>

#include "tests/unit/app_fixture.h"

namespace vaelo {
namespace {

using QuotaFetcherTest = AppFixture;

class QuotaListener : public QuotaFetcherDelegate {
 public:
  void quotaFetcherDidUpdateValue(QuotaFetcher&, std::uint64_t freeBytes) override { values.push_back(freeBytes); }
  std::vector<std::uint64_t> values;
};

TEST_F(QuotaFetcherTest, TheFetcherAsksAtOnceAndThenEveryInterval) {
  const auto fetcher = QuotaFetcher::init();
  const auto listener = std::make_shared<QuotaListener>();
  setFreeBytes(7);
  fetcher->setDelegate(listener);
  fetcher->runWithInterval(300);
  runAllQueues();
  EXPECT_EQ(quotaFetches(), 1);
  EXPECT_EQ(listener->values, std::vector<std::uint64_t>{7});
  advance(std::chrono::seconds(299));
  EXPECT_EQ(quotaFetches(), 1);
  advance(std::chrono::seconds(2));
  EXPECT_EQ(quotaFetches(), 2);
  fetcher->fetchNow();
  runAllQueues();
  EXPECT_EQ(quotaFetches(), 3);
}

TEST_F(QuotaFetcherTest, ASecondIntervalReplacesTheFirst) {
  const auto fetcher = QuotaFetcher::init();
  fetcher->runWithInterval(10);
  fetcher->runWithInterval(100);
  runAllQueues();
  const int before = quotaFetches();
  advance(std::chrono::seconds(99));
  EXPECT_EQ(quotaFetches(), before);
  ASSERT_EQ(memory.queues.timers.size(), 2u);
  EXPECT_EQ(memory.queues.timers[1].others, 0) << "the first is gone before there is a second";
}

TEST_F(QuotaFetcherTest, ADroppedFetcherAsksNoMore) {
  auto fetcher = QuotaFetcher::init();
  fetcher->runWithInterval(10);
  runAllQueues();
  const int before = quotaFetches();
  fetcher = nullptr;
  advance(std::chrono::seconds(60));
  EXPECT_EQ(quotaFetches(), before);
}

TEST_F(QuotaFetcherTest, NothingIsFetchedInTheBackground) {
  const auto fetcher = QuotaFetcher::init();
  resignActive();
  EXPECT_FALSE(fetcher->canFetch());
  EXPECT_TRUE(logged("INFO", "Got WillResignActiveNotification (quota)"));
  fetcher->performFetch();
  runAllQueues();
  EXPECT_EQ(quotaFetches(), 0);
  EXPECT_TRUE(logged("DEBUG", "Not fetching quota: backgrounded."));
  becomeActive();
  EXPECT_TRUE(fetcher->canFetch());
  EXPECT_TRUE(logged("INFO", "Got DidBecomeActiveNotification (quota)"));
}

TEST_F(QuotaFetcherTest, NothingIsFetchedWithoutAnAccount) {
  signOut();
  const auto fetcher = QuotaFetcher::init();
  bool completed = false;
  fetcher->fetchUserQuotaWithCompletion([&completed](std::int64_t, const std::optional<Error>&) { completed = true; });
  runAllQueues();
  EXPECT_FALSE(completed);
  EXPECT_TRUE(logged("INFO", "Not fetching quota. Ubiquity is not enabled"));
}

TEST_F(QuotaFetcherTest, AFailedFetchKeepsThePreviousValue) {
  const auto fetcher = QuotaFetcher::init();
  const auto listener = std::make_shared<QuotaListener>();
  fetcher->setDelegate(listener);
  const Error error{CloudDocumentsErrorDomain, 3, {}, "offline", {}};
  setFreeBytes(7);
  fetcher->performFetch();
  runAllQueues();
  failQuota(error);
  fetcher->performFetch();
  runAllQueues();
  EXPECT_EQ(listener->values, std::vector<std::uint64_t>{7});
  EXPECT_EQ(fetcher->freeBytes(), 7u);
  EXPECT_TRUE(logged("WARNING", "can't update quota: " + error.description()));
}

TEST_F(QuotaFetcherTest, TheTimerRunsOnTheFetchersQueueWithASecondToSpare) {
  const auto fetcher = QuotaFetcher::init();
  fetcher->runWithInterval(2.0000000015);
  ASSERT_EQ(memory.queues.timers.size(), 1u);
  EXPECT_EQ(memory.queues.timers[0].queue, "com.marrow.VaeloDriveApp.quotafetcher");
  EXPECT_EQ(memory.queues.timers[0].interval, std::chrono::nanoseconds(2'000'000'001)) << "whole nanoseconds";
  EXPECT_EQ(memory.queues.timers[0].leeway, std::chrono::seconds(1));
}

TEST_F(QuotaFetcherTest, TheWindowPollsEveryFiveMinutes) {
  loadNav();
  ASSERT_EQ(memory.queues.timers.size(), 1u);
  EXPECT_EQ(memory.queues.timers[0].interval, std::chrono::seconds(300));
}

TEST_F(QuotaFetcherTest, RequestsAreOperationsOfUtilityPriority) {
  std::shared_ptr<MemoryOperationQueue> operations;
  memory.queues.makesOperationQueue = [&](const std::string& name, QualityOfService quality) {
    operations = std::make_shared<MemoryOperationQueue>(memory.clock, name, quality);
    return operations;
  };
  const auto fetcher = QuotaFetcher::init();
  const auto listener = std::make_shared<QuotaListener>();
  fetcher->setDelegate(listener);
  setFreeBytes(7);
  fetcher->performFetch();
  ASSERT_NE(operations, nullptr);
  EXPECT_EQ(operations->qualityOfService(), QualityOfService::Utility);
  EXPECT_EQ(quotaFetches(), 0) << "not on the caller's thread";
  operations->finishNow();
  EXPECT_EQ(quotaFetches(), 1);
  EXPECT_TRUE(listener->values.empty()) << "only on the main queue";
  runMainQueue();
  EXPECT_EQ(listener->values, std::vector<std::uint64_t>{7});
}

TEST_F(QuotaFetcherTest, NothingThatIsPendingKeepsTheFetcher) {
  auto fetcher = QuotaFetcher::init();
  const std::weak_ptr<QuotaFetcher> weak = fetcher;
  fetcher->runWithInterval(10);
  fetcher->fetchNow();
  fetcher->performFetch();
  fetcher = nullptr;
  EXPECT_TRUE(weak.expired());
  runAllQueues();
  EXPECT_EQ(quotaFetches(), 1) << "what was asked already";
}

TEST_F(QuotaFetcherTest, AnAnswerOnItsWayDoesNotKeepTheFetcher) {
  std::shared_ptr<MemoryOperationQueue> operations;
  memory.queues.makesOperationQueue = [&](const std::string& name, QualityOfService quality) {
    operations = std::make_shared<MemoryOperationQueue>(memory.clock, name, quality);
    return operations;
  };
  auto fetcher = QuotaFetcher::init();
  const auto listener = std::make_shared<QuotaListener>();
  fetcher->setDelegate(listener);
  fetcher->performFetch();
  operations->finishNow();
  const std::weak_ptr<QuotaFetcher> weak = fetcher;
  fetcher = nullptr;
  EXPECT_TRUE(weak.expired());
  runAllQueues();
  EXPECT_TRUE(listener->values.empty());
}

TEST_F(QuotaFetcherTest, TheTimerGoesOnInTheBackgroundAndFetchesNothing) {
  const auto fetcher = QuotaFetcher::init();
  fetcher->runWithInterval(10);
  runAllQueues();
  resignActive();
  advance(std::chrono::seconds(20));
  EXPECT_EQ(quotaFetches(), 1);
  EXPECT_EQ(log().count("DEBUG", "Not fetching quota: backgrounded."), 2u);
  becomeActive();
  EXPECT_EQ(quotaFetches(), 1) << "not before its time";
  advance(std::chrono::seconds(10));
  EXPECT_EQ(quotaFetches(), 2);
}

TEST_F(QuotaFetcherTest, AnAccountMayHaveNoneFreeOrMoreThanAnyDisk) {
  const auto fetcher = QuotaFetcher::init();
  const auto listener = std::make_shared<QuotaListener>();
  fetcher->setDelegate(listener);
  constexpr std::int64_t most = std::numeric_limits<std::int64_t>::max();
  for (const std::int64_t bytes : {std::int64_t{0}, most}) {
    setFreeBytes(bytes);
    fetcher->performFetch();
    runAllQueues();
  }
  EXPECT_EQ(listener->values, (std::vector<std::uint64_t>{0, 9'223'372'036'854'775'807u}));
}

}  // namespace
}  // namespace vaelo
