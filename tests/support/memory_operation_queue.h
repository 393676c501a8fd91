// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <deque>
#include <memory>
#include <mutex>

#include "tests/support/memory_clock.h"

namespace vaelo {

/// Operations that run one at a time as the virtual clock gets to them, or when somebody waits for the queue.
class MemoryOperationQueue : public OperationQueue {
 public:
  MemoryOperationQueue(std::shared_ptr<MemoryClock> clock, std::string name, QualityOfService quality)
      : clock_(std::move(clock)), name_(std::move(name)), quality_(quality) {}
  void addOperation(Block operation) override {
    {
      const std::lock_guard lock(pending_->mutex);
      pending_->operations.push_back(std::move(operation));
    }
    // Runs although the queue may be gone by then.
    clock_->post({}, [pending = pending_] { runOne(*pending); });
  }
  std::string name() const override { return name_; }
  QualityOfService qualityOfService() const override { return quality_; }
  /// Runs what was given to the queue before its time comes.
  void finishNow() {
    while (runOne(*pending_)) {
    }
  }

 private:
  struct Pending {
    std::mutex mutex;
    std::deque<Block> operations;  // guarded by mutex
  };
  static bool runOne(Pending& pending) {
    Block operation;
    {
      const std::lock_guard lock(pending.mutex);
      if (pending.operations.empty()) return false;
      operation = std::move(pending.operations.front());
      pending.operations.pop_front();
    }
    operation();
    return true;
  }

  std::shared_ptr<MemoryClock> clock_;
  std::string name_;
  QualityOfService quality_;
  std::shared_ptr<Pending> pending_ = std::make_shared<Pending>();
};

}  // namespace vaelo
