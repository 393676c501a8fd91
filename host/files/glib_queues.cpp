// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/files/glib_queues.h"

#include <glib.h>
#include <sys/resource.h>
#include <unistd.h>

#include <algorithm>
#include <atomic>
#include <condition_variable>
#include <deque>
#include <map>
#include <mutex>
#include <thread>
#include <vector>

namespace vaelo {

namespace {

gboolean runBlock(gpointer held) {
  (*static_cast<Block*>(held))();
  return G_SOURCE_REMOVE;
}

void post(std::chrono::nanoseconds delay, Block block) {
  const auto milliseconds = std::min<std::int64_t>(std::chrono::ceil<std::chrono::milliseconds>(delay).count(), G_MAXINT);
  GSource* source = delay.count() > 0 ? g_timeout_source_new(static_cast<guint>(milliseconds)) : g_idle_source_new();
  // The same for both, so that blocks run in the order in which they came.
  g_source_set_priority(source, G_PRIORITY_DEFAULT);
  g_source_set_callback(source, runBlock, new Block(std::move(block)),
                        [](gpointer held) { delete static_cast<Block*>(held); });
  g_source_attach(source, nullptr);
  g_source_unref(source);
}

class MainQueue : public DispatchQueue {
 public:
  void async(Block block) override { post({}, std::move(block)); }
  void after(std::chrono::nanoseconds delay, Block block) override { post(delay, std::move(block)); }
  std::string label() const override { return "main"; }
};

/// One thread, begun by the first block.
class SerialQueue : public DispatchQueue {
 public:
  explicit SerialQueue(std::string label) : label_(std::move(label)) {}
  ~SerialQueue() override {
    {
      const std::lock_guard lock(shared_->mutex);
      shared_->stopping = true;
    }
    shared_->changed.notify_one();
    if (!thread_.joinable()) return;
    // A block may hold the last reference to its own queue.
    if (thread_.get_id() == std::this_thread::get_id()) {
      thread_.detach();
    } else {
      thread_.join();
    }
  }
  void async(Block block) override {
    add([&](Shared& shared) { shared.ready.push_back(std::move(block)); });
  }
  void after(std::chrono::nanoseconds delay, Block block) override {
    const auto moment = std::chrono::steady_clock::now() + delay;
    add([&](Shared& shared) { shared.delayed.emplace(moment, std::move(block)); });
  }
  std::string label() const override { return label_; }

 private:
  struct Shared {
    std::mutex mutex;  // guards all below
    std::condition_variable changed;
    std::deque<Block> ready;
    std::multimap<std::chrono::steady_clock::time_point, Block> delayed;
    bool stopping = false;
  };
  template <typename Change>
  void add(Change change) {
    {
      const std::lock_guard lock(shared_->mutex);
      change(*shared_);
      if (!thread_.joinable()) thread_ = std::thread([shared = shared_] { work(*shared); });
    }
    shared_->changed.notify_one();
  }
  static void work(Shared& shared) {
    std::unique_lock lock(shared.mutex);
    for (;;) {
      const auto now = std::chrono::steady_clock::now();
      while (!shared.delayed.empty() && shared.delayed.begin()->first <= now) {
        shared.ready.push_back(std::move(shared.delayed.begin()->second));
        shared.delayed.erase(shared.delayed.begin());
      }
      if (!shared.ready.empty()) {
        Block block = std::move(shared.ready.front());
        shared.ready.pop_front();
        lock.unlock();
        block();
        // What it holds goes before the next one runs, and not under the lock.
        block = nullptr;
        lock.lock();
      } else if (shared.stopping) {
        return;
      } else if (shared.delayed.empty()) {
        shared.changed.wait(lock);
      } else {
        const auto next = shared.delayed.begin()->first;
        shared.changed.wait_until(lock, next);
      }
    }
  }
  const std::string label_;
  std::shared_ptr<Shared> shared_ = std::make_shared<Shared>();
  std::thread thread_;  // guarded by shared_->mutex, but for the destructor
};

class ThreadedOperations : public OperationQueue {
 public:
  ThreadedOperations(std::string name, QualityOfService quality) : name_(std::move(name)), quality_(quality) {}
  ~ThreadedOperations() override {
    std::vector<std::thread> threads;
    {
      const std::lock_guard lock(shared_->mutex);
      shared_->stopping = true;
      threads.swap(threads_);
    }
    shared_->changed.notify_all();
    for (std::thread& thread : threads) {
      if (thread.get_id() == std::this_thread::get_id()) {
        thread.detach();
      } else {
        thread.join();
      }
    }
  }
  void addOperation(Block operation) override {
    const std::lock_guard lock(shared_->mutex);
    shared_->waiting.push_back(std::move(operation));
    constexpr std::size_t limit = 2;
    if (shared_->idle < shared_->waiting.size() && threads_.size() < limit) {
      threads_.emplace_back([shared = shared_, quality = quality_] {
        const bool patient = quality == QualityOfService::Utility || quality == QualityOfService::Background;
        // Of this thread alone; what nobody waits for must not slow down what the user sees.
        if (patient) setpriority(PRIO_PROCESS, static_cast<id_t>(gettid()), 10);
        work(*shared);
      });
    }
    shared_->changed.notify_one();
  }
  std::string name() const override { return name_; }
  QualityOfService qualityOfService() const override { return quality_; }

 private:
  struct Shared {
    std::mutex mutex;  // guards all below
    std::condition_variable changed;
    std::deque<Block> waiting;
    std::size_t idle = 0;
    bool stopping = false;
  };
  static void work(Shared& shared) {
    std::unique_lock lock(shared.mutex);
    for (;;) {
      ++shared.idle;
      shared.changed.wait(lock, [&] { return shared.stopping || !shared.waiting.empty(); });
      --shared.idle;
      if (shared.waiting.empty()) return;
      Block operation = std::move(shared.waiting.front());
      shared.waiting.pop_front();
      lock.unlock();
      operation();
      operation = nullptr;
      lock.lock();
    }
  }
  std::string name_;
  QualityOfService quality_;
  std::shared_ptr<Shared> shared_ = std::make_shared<Shared>();
  std::vector<std::thread> threads_;  // guarded by shared_->mutex
};

/// Posts its handler to the queue again and again until it is gone.
class QueueTimer : public TimerSource {
 public:
  QueueTimer(std::shared_ptr<DispatchQueue> queue, std::chrono::nanoseconds interval, Block handler)
      : alive_(std::make_shared<State>()) {
    alive_->queue = std::move(queue);
    alive_->interval = interval;
    alive_->handler = std::move(handler);
    alive_->queue->async([state = alive_] { fire(state); });
  }
  ~QueueTimer() override { alive_->running = false; }

 private:
  struct State {
    std::shared_ptr<DispatchQueue> queue;
    std::chrono::nanoseconds interval;
    Block handler;
    std::atomic<bool> running = true;
  };
  static void fire(const std::shared_ptr<State>& state) {
    if (!state->running) return;
    state->handler();
    // Weak, so that a stopped timer does not keep its queue for a whole interval.
    const std::weak_ptr<State> weak = state;
    state->queue->after(state->interval, [weak] {
      if (const auto again = weak.lock()) fire(again);
    });
  }
  std::shared_ptr<State> alive_;
};

}  // namespace

GLibQueues::GLibQueues() : main_(std::make_unique<MainQueue>()) {}
GLibQueues::~GLibQueues() = default;

DispatchQueue& GLibQueues::main() { return *main_; }

std::shared_ptr<DispatchQueue> GLibQueues::makeSerialQueue(const std::string& label) {
  return std::make_shared<SerialQueue>(label);
}

std::shared_ptr<OperationQueue> GLibQueues::makeOperationQueue(const std::string& name, QualityOfService quality) {
  return std::make_shared<ThreadedOperations>(name, quality);
}

std::unique_ptr<TimerSource> GLibQueues::makeTimer(std::shared_ptr<DispatchQueue> queue, std::chrono::nanoseconds interval,
                                                   std::chrono::nanoseconds, Block handler) {
  return std::make_unique<QueueTimer>(std::move(queue), interval, std::move(handler));
}

}  // namespace vaelo
