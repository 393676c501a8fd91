// SPDX-License-Identifier: GPL-3.0-or-later
#include <glib.h>
#include <gtest/gtest.h>

#include <algorithm>
#include <atomic>
#include <future>
#include <memory>
#include <thread>
#include <vector>

#include "host/files/glib_queues.h"

namespace vaelo {

namespace {

using namespace std::chrono_literals;

void runMainLoopUntil(const std::atomic<bool>& done) {
  while (!done) g_main_context_iteration(nullptr, TRUE);
}

TEST(FilesQueuesTest, TheMainQueueRunsOnTheMainLoopInOrder) {
  GLibQueues queues;
  std::vector<int> order;
  std::atomic<bool> done = false;
  queues.main().after(1ms, [&] {
    order.push_back(3);
    done = true;
  });
  queues.main().async([&] { order.push_back(1); });
  queues.main().async([&] { order.push_back(2); });
  EXPECT_TRUE(order.empty());
  runMainLoopUntil(done);
  EXPECT_EQ(order, (std::vector<int>{1, 2, 3}));
}

TEST(FilesQueuesTest, ADelayIsNotShorterThanAsked) {
  GLibQueues queues;
  std::atomic<bool> done = false;
  const auto begin = std::chrono::steady_clock::now();
  queues.main().after(20ms, [&] { done = true; });
  runMainLoopUntil(done);
  EXPECT_GE(std::chrono::steady_clock::now() - begin, 19ms);
}

TEST(FilesQueuesTest, ASerialQueueRunsOneBlockAtATimeInOrder) {
  GLibQueues queues;
  const auto queue = queues.makeSerialQueue("serial");
  EXPECT_EQ(queue->label(), "serial");
  std::vector<int> order;
  std::promise<void> done;
  for (int i = 0; i < 1000; ++i) queue->async([&order, i] { order.push_back(i); });
  queue->async([&] { done.set_value(); });
  done.get_future().wait();
  ASSERT_EQ(order.size(), 1000u);
  EXPECT_TRUE(std::is_sorted(order.begin(), order.end()));
}

TEST(FilesQueuesTest, ASerialQueueThatIsLetGoOfRunsWhatItWasGiven) {
  GLibQueues queues;
  std::atomic<int> ran = 0;
  auto queue = queues.makeSerialQueue("serial");
  for (int i = 0; i < 100; ++i) queue->async([&ran] { ++ran; });
  queue->after(1h, [&ran] { ran = -1; });
  queue.reset();
  EXPECT_EQ(ran, 100);
}

TEST(FilesQueuesTest, ABlockMayHoldTheLastReferenceToItsQueue) {
  GLibQueues queues;
  std::promise<void> done;
  std::promise<void> released;
  auto queue = queues.makeSerialQueue("serial");
  const std::weak_ptr<DispatchQueue> weak = queue;
  auto& raw = *queue;
  raw.async([held = std::move(queue), wait = done.get_future().share(), &released]() mutable {
    wait.wait();
    held.reset();
    released.set_value();
  });
  done.set_value();
  released.get_future().wait();
  EXPECT_TRUE(weak.expired());
}

TEST(FilesQueuesTest, OperationsRunAtTheSameTime) {
  GLibQueues queues;
  const auto queue = queues.makeOperationQueue("operations", QualityOfService::Utility);
  EXPECT_EQ(queue->name(), "operations");
  EXPECT_EQ(queue->qualityOfService(), QualityOfService::Utility);
  for (int round = 0; round < 50; ++round) {
    const auto fresh = queues.makeOperationQueue("fresh", QualityOfService::Default);
    std::promise<void> alone;
    fresh->addOperation([&] { alone.set_value(); });
    alone.get_future().wait();
    for (int turn = 0; turn < 500; ++turn) std::this_thread::yield();
    // The one thread is idle by now, as a rule, and may not be counted on for both.
    std::promise<void> second;
    std::promise<bool> met;
    fresh->addOperation([&] { met.set_value(second.get_future().wait_for(5s) == std::future_status::ready); });
    fresh->addOperation([&] { second.set_value(); });
    ASSERT_TRUE(met.get_future().get());
  }
}

TEST(FilesQueuesTest, AnOperationQueueThatIsDestroyedFinishesFirst) {
  GLibQueues queues;
  std::atomic<int> ran = 0;
  auto queue = queues.makeOperationQueue("operations", QualityOfService::Default);
  for (int i = 0; i < 100; ++i) queue->addOperation([&ran] { ++ran; });
  queue.reset();
  EXPECT_EQ(ran, 100);
}

TEST(FilesQueuesTest, ATimerFiresAtOnceAndAgainUntilItIsGone) {
  GLibQueues queues;
  const auto queue = queues.makeSerialQueue("timer");
  std::atomic<int> fired = 0;
  std::promise<void> third;
  auto timer = queues.makeTimer(queue, 1ms, 1s, [&] {
    if (++fired == 3) third.set_value();
  });
  third.get_future().wait();
  std::promise<void> stopped;
  queue->async([&] {
    timer.reset();
    fired = 0;
    // Well after the next firing would have come.
    queue->after(20ms, [&] { stopped.set_value(); });
  });
  stopped.get_future().wait();
  EXPECT_EQ(fired, 0);
  std::promise<void> first;
  const auto slow = queues.makeTimer(queue, 1h, 1s, [&] { first.set_value(); });
  first.get_future().wait();
}

}  // namespace

}  // namespace vaelo
