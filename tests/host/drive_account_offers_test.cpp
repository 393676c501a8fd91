// SPDX-License-Identifier: GPL-3.0-or-later
#include <gtest/gtest.h>

#include "host/drive/account_offers.h"
#include "tests/support/memory_queues.h"

namespace vaelo {
namespace {

class AccountOffersTest : public testing::Test {
 protected:
  ~AccountOffersTest() override { clock->forgetWhatIsLeft(); }
  void measured(std::int64_t free, std::int64_t total = 1000) {
    offers.storageMeasured({free, total});
    clock->advance({});
  }
  int level() { return offers.currentOffer() ? offers.currentOffer()->level() : 0; }
  void pass(std::chrono::seconds time) { clock->advance(time); }

  std::shared_ptr<MemoryClock> clock = std::make_shared<MemoryClock>();
  MemoryQueues queues{clock};
  NotificationCenter notifications;
  std::optional<UpgradeTerms> terms = UpgradeTerms{"https://example.org", {20, 10, 5}, false};
  int measures = 0;
  int changes = 0;
  NotificationCenter::Token observation =
      notifications.addObserver(OfferChangedNotification, [this](const Notification&) { ++changes; });
  AccountOffers offers{{[this] { return terms; }, [this] { ++measures; }}, queues, notifications};
};

TEST_F(AccountOffersTest, WithoutTermsThereIsNeverAnOffer) {
  terms.reset();
  EXPECT_FALSE(offers.fetchOfferIfNeeded());
  measured(0);
  measured(0, 0);
  offers.accountChanged(true);
  pass(std::chrono::hours(1));
  EXPECT_EQ(offers.currentOffer(), nullptr);
  EXPECT_EQ(changes, 0);
  EXPECT_EQ(measures, 0);
}

TEST_F(AccountOffersTest, AFetchIsNeededUntilAFreshAnswerIsThere) {
  EXPECT_TRUE(offers.fetchOfferIfNeeded());
  EXPECT_EQ(measures, 1);
  measured(500);
  EXPECT_FALSE(offers.fetchOfferIfNeeded());
  pass(AccountOffers::FreshFor);
  EXPECT_TRUE(offers.fetchOfferIfNeeded());
  EXPECT_EQ(measures, 2);
}

TEST_F(AccountOffersTest, TheLevelIsHowManyThresholdsThereIsLessThan) {
  struct {
    std::int64_t free;
    int level;
  } const rows[] = {{1000, 0}, {200, 0}, {199, 1}, {100, 1}, {99, 2}, {50, 2}, {49, 3}, {0, 3}, {300, 0}};
  for (const auto& row : rows) {
    measured(row.free);
    pass(AccountOffers::ChangePause);
    EXPECT_EQ(level(), row.level) << row.free;
  }
  EXPECT_EQ(changes, 5) << "that nothing is left is another one, too";
}

TEST_F(AccountOffersTest, AnAccountThatMayHoldNothingIsFull) {
  measured(0, 0);
  EXPECT_EQ(level(), 3);
}

TEST_F(AccountOffersTest, MeasuresAtTheSameLevelKeepTheOffer) {
  measured(150);
  const StorageOfferRef first = offers.currentOffer();
  measured(140);
  EXPECT_EQ(offers.currentOffer(), first);
  EXPECT_EQ(changes, 1);
  EXPECT_EQ(std::static_pointer_cast<ProviderOffer>(first)->figures().free, 140);
}

// The button of the one says that the storage is almost full, that of the other that it is.
TEST_F(AccountOffersTest, WhenNothingIsLeftThereIsAnotherOfferOfTheSameLevel) {
  measured(1);
  const StorageOfferRef first = offers.currentOffer();
  pass(AccountOffers::ChangePause);
  measured(0);
  EXPECT_NE(offers.currentOffer(), first);
  EXPECT_EQ(level(), 3);
  EXPECT_EQ(changes, 2);
  measured(0);
  EXPECT_EQ(changes, 2);
}

TEST_F(AccountOffersTest, AMeasureThatChangesByTheSecondChangesTheOfferOnceInAWhile) {
  for (int second = 0; second < 120; ++second) {
    measured(second % 2 == 0 ? 10 : 900);
    pass(std::chrono::seconds(1));
  }
  EXPECT_LE(changes, 3);
  EXPECT_GE(changes, 2);
  // In the end the offer is as the last measure says.
  measured(900);
  pass(2 * AccountOffers::ChangePause);
  EXPECT_EQ(level(), 0);
}

TEST_F(AccountOffersTest, OtherTermsAreAnotherOfferAtOnce) {
  measured(150);
  const StorageOfferRef first = offers.currentOffer();
  terms->page = "https://example.org/other";
  offers.accountChanged(false);
  EXPECT_NE(offers.currentOffer(), first);
  EXPECT_EQ(level(), 1);
  EXPECT_EQ(changes, 2);
  terms.reset();
  offers.accountChanged(false);
  EXPECT_EQ(offers.currentOffer(), nullptr);
  EXPECT_EQ(changes, 3);
}

TEST_F(AccountOffersTest, WhatWasBoughtIsMeasuredAndNeedNotWait) {
  measured(150);
  measured(10);  // waits for the pause to end
  EXPECT_EQ(level(), 1);
  offers.accountChanged(false);
  EXPECT_EQ(measures, 1);
  EXPECT_EQ(level(), 3);
  measured(900);
  EXPECT_EQ(level(), 0);
}

TEST_F(AccountOffersTest, AnotherAccountIsMeasuredAnew) {
  measured(10);
  offers.accountChanged(true);
  EXPECT_EQ(offers.currentOffer(), nullptr);
  EXPECT_EQ(measures, 1);
  measured(10);
  EXPECT_EQ(level(), 3);  // the pause of the account before is not its
}

TEST_F(AccountOffersTest, WhatComesAfterTheEndIsDropped) {
  {
    AccountOffers gone{{[this] { return terms; }, [] {}}, queues, notifications};
    gone.storageMeasured({1, 1000});
  }
  pass(std::chrono::seconds(1));
  EXPECT_EQ(changes, 0);
}

}  // namespace
}  // namespace vaelo
