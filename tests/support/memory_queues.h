// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <algorithm>
#include <functional>
#include <memory>
#include <string>
#include <vector>

#include "tests/support/memory_dispatch_queue.h"
#include "tests/support/memory_operation_queue.h"
#include "tests/support/memory_timer.h"

namespace vaelo {

/// Time and threads without threads: everything runs when the test advances the clock.
class MemoryQueues : public Queues {
 public:
  explicit MemoryQueues(std::shared_ptr<MemoryClock> clock) : clock_(std::move(clock)), main_(clock_, "main") {}
  DispatchQueue& main() override { return main_; }
  std::shared_ptr<DispatchQueue> makeSerialQueue(const std::string& label) override {
    return std::make_shared<MemoryDispatchQueue>(clock_, label);
  }
  std::shared_ptr<OperationQueue> makeOperationQueue(const std::string& name, QualityOfService quality) override {
    if (makesOperationQueue) return makesOperationQueue(name, quality);
    return std::make_shared<MemoryOperationQueue>(clock_, name, quality);
  }
  std::unique_ptr<TimerSource> makeTimer(std::shared_ptr<DispatchQueue> queue, std::chrono::nanoseconds interval,
                                         std::chrono::nanoseconds leeway, Block handler) override {
    const auto others = std::count_if(lives_.begin(), lives_.end(), [](const auto& life) { return !life.expired(); });
    timers.push_back({queue ? queue->label() : "", interval, leeway, others});
    auto timer =
        std::make_unique<MemoryTimer>(queue ? std::move(queue) : makeSerialQueue("timer"), interval, std::move(handler));
    lives_.push_back(timer->life());
    return timer;
  }
  Date now() override { return clock_->date(); }

  struct AskedTimer {
    std::string queue;  ///< its label
    std::chrono::nanoseconds interval;
    std::chrono::nanoseconds leeway;
    std::ptrdiff_t others;  ///< timers that ran when it was made
  };
  std::vector<AskedTimer> timers;  ///< all that were asked for

  /// Where a test wants other queues, with real threads.
  std::function<std::shared_ptr<OperationQueue>(const std::string&, QualityOfService)> makesOperationQueue;

 private:
  std::shared_ptr<MemoryClock> clock_;
  MemoryDispatchQueue main_;
  std::vector<std::weak_ptr<const void>> lives_;  // of the timers
};

}  // namespace vaelo
