// SPDX-License-Identifier: GPL-3.0-or-later
#include <atomic>
#include <chrono>

#include "tests/contract/contract_test.h"

namespace vaelo::contract {
namespace {

using namespace std::chrono_literals;
using Names = std::vector<std::string>;

class QueuesContract : public ContractTest {
 protected:
  Queues& queues() { return platform->queues(); }
  Block note(const std::string& what) {
    return [this, what] {
      const std::lock_guard lock(mutex_);
      noted_.push_back(what);
    };
  }
  Names noted() {
    const std::lock_guard lock(mutex_);
    return noted_;
  }
  bool untilNoted(std::size_t count) {
    return platform->until([&] { return noted().size() >= count; });
  }

 private:
  std::mutex mutex_;
  Names noted_;  // guarded by mutex_
};

VAELO_CONTRACT_SUITE(QueuesContract);

TEST_P(QueuesContract, BlocksOfTheMainQueueRunLaterInTheirOrder) {
  for (const char* what : {"a", "b", "c"}) queues().main().async(note(what));
  EXPECT_TRUE(noted().empty()) << "never within the call";
  EXPECT_TRUE(untilNoted(3));
  EXPECT_EQ(noted(), (Names{"a", "b", "c"}));
}

TEST_P(QueuesContract, ABlockThatIsAddedByABlockRunsAfterThoseThatWait) {
  queues().main().async([this] {
    note("a")();
    queues().main().async(note("c"));
  });
  queues().main().async(note("b"));
  EXPECT_TRUE(untilNoted(3));
  EXPECT_EQ(noted(), (Names{"a", "b", "c"}));
}

TEST_P(QueuesContract, DelayedBlocksRunInTheOrderOfTheirTimes) {
  queues().main().after(500ms, note("late"));
  queues().main().after(20ms, note("early"));
  queues().main().async(note("now"));
  EXPECT_TRUE(untilNoted(3));
  EXPECT_EQ(noted(), (Names{"now", "early", "late"}));
}

TEST_P(QueuesContract, ADelayIsNoShorterThanAskedFor) {
  const Date start = queues().now();
  queues().main().after(20ms, note("later"));
  EXPECT_TRUE(untilNoted(1));
  EXPECT_GE(queues().now() - start, 19ms);
}

TEST_P(QueuesContract, ASerialQueueRunsOneBlockAfterTheOther) {
  const auto queue = queues().makeSerialQueue("com.example.serial");
  EXPECT_EQ(queue->label(), "com.example.serial");
  std::atomic<int> running = 0;
  std::atomic<bool> overlapped = false;
  Names expected;
  for (int i = 0; i < 20; ++i) {
    expected.push_back(std::to_string(i));
    queue->async([&, noteIt = note(std::to_string(i))] {
      if (++running > 1) overlapped = true;
      noteIt();
      --running;
    });
  }
  EXPECT_TRUE(untilNoted(20));
  EXPECT_EQ(noted(), expected);
  EXPECT_FALSE(overlapped);
}

TEST_P(QueuesContract, ASerialQueueDelaysToo) {
  const auto queue = queues().makeSerialQueue("serial");
  queue->after(40ms, note("late"));
  queue->after(10ms, note("early"));
  queue->async(note("now"));
  EXPECT_TRUE(untilNoted(3));
  EXPECT_EQ(noted(), (Names{"now", "early", "late"}));
}

TEST_P(QueuesContract, OperationsAllRunLater) {
  const auto queue = queues().makeOperationQueue("com.example.work", QualityOfService::Utility);
  EXPECT_EQ(queue->name(), "com.example.work");
  EXPECT_EQ(queue->qualityOfService(), QualityOfService::Utility);
  for (int i = 0; i < 20; ++i) queue->addOperation(note("x"));
  EXPECT_TRUE(untilNoted(20));
  EXPECT_EQ(noted().size(), 20u);
}

TEST_P(QueuesContract, AnOperationMayAddAnother) {
  const auto queue = queues().makeOperationQueue("work", QualityOfService::Default);
  queue->addOperation([&] {
    note("a")();
    queue->addOperation(note("b"));
  });
  EXPECT_TRUE(untilNoted(2));
  EXPECT_EQ(noted(), (Names{"a", "b"}));
}

TEST_P(QueuesContract, ATimerFiresNowAndThenInIntervals) {
  const Date start = queues().now();
  const auto queue = queues().makeSerialQueue("timer");
  const auto timer = queues().makeTimer(queue, 20ms, 5ms, note("tick"));
  EXPECT_TRUE(untilNoted(1));
  EXPECT_TRUE(untilNoted(3));
  EXPECT_GE(queues().now() - start, 38ms);
}

TEST_P(QueuesContract, ATimerThatIsGoneFiresNoMore) {
  const auto queue = queues().makeSerialQueue("timer");
  auto timer = queues().makeTimer(queue, 10ms, 0ms, note("tick"));
  EXPECT_TRUE(untilNoted(1));
  timer = nullptr;
  // What was under way when it went has ended by the time that the next block of its queue runs.
  std::atomic<std::size_t> ticks = 0;
  queue->async([&] { ticks = noted().size(); });
  EXPECT_TRUE(platform->until([&] { return ticks > 0; }));
  std::atomic<bool> passed = false;
  queue->after(50ms, [&] { passed = true; });
  EXPECT_TRUE(platform->until([&] { return passed.load(); }));
  EXPECT_EQ(noted().size(), ticks);
}

TEST_P(QueuesContract, ATimerMayEndItself) {
  const auto queue = queues().makeSerialQueue("timer");
  std::mutex mutex;
  std::unique_ptr<TimerSource> timer;
  std::atomic<bool> ended = false;
  {
    const std::lock_guard lock(mutex);
    timer = queues().makeTimer(queue, 10ms, 0ms, [&] {
      note("tick")();
      const std::lock_guard inner(mutex);
      timer = nullptr;
      ended = true;
    });
  }
  EXPECT_TRUE(platform->until([&] { return ended.load(); }));
  std::atomic<bool> passed = false;
  queue->after(50ms, [&] { passed = true; });
  EXPECT_TRUE(platform->until([&] { return passed.load(); }));
  EXPECT_EQ(noted().size(), 1u);
}

TEST_P(QueuesContract, TimeDoesNotGoBack) {
  Date last = queues().now();
  for (int i = 0; i < 3; ++i) {
    const std::size_t before = noted().size();
    queues().main().after(1ms, note("x"));
    EXPECT_TRUE(untilNoted(before + 1));
    EXPECT_GE(queues().now(), last);
    last = queues().now();
  }
}

}  // namespace
}  // namespace vaelo::contract
