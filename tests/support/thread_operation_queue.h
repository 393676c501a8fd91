// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <condition_variable>
#include <deque>
#include <mutex>
#include <string>
#include <thread>
#include <utility>

#include "platform/queues.h"

namespace vaelo {

/// Runs operations one after another on a thread of its own; destruction waits for all.
class ThreadOperationQueue : public OperationQueue {
 public:
  ThreadOperationQueue(std::string name, QualityOfService quality)
      : name_(std::move(name)), quality_(quality), thread_([this] { work(); }) {}
  ~ThreadOperationQueue() override {
    {
      const std::lock_guard lock(mutex_);
      ending_ = true;
    }
    changed_.notify_all();
    thread_.join();
  }
  void addOperation(Block operation) override {
    {
      const std::lock_guard lock(mutex_);
      operations_.push_back(std::move(operation));
    }
    changed_.notify_all();
  }
  std::string name() const override { return name_; }
  QualityOfService qualityOfService() const override { return quality_; }
  void waitUntilAllFinished() {
    std::unique_lock lock(mutex_);
    changed_.wait(lock, [this] { return operations_.empty() && !running_; });
  }

 private:
  void work() {
    std::unique_lock lock(mutex_);
    while (true) {
      changed_.wait(lock, [this] { return ending_ || !operations_.empty(); });
      if (operations_.empty()) return;
      {
        const Block operation = std::move(operations_.front());
        operations_.pop_front();
        running_ = true;
        lock.unlock();
        operation();
        lock.lock();
      }
      running_ = false;
      changed_.notify_all();
    }
  }

  std::string name_;
  QualityOfService quality_;
  std::mutex mutex_;
  std::condition_variable changed_;
  std::deque<Block> operations_;  // guarded by mutex_
  bool ending_ = false;           // guarded by mutex_
  bool running_ = false;          // guarded by mutex_
  std::thread thread_;
};

}  // namespace vaelo
