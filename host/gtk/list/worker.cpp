// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/gtk/list/worker.h"

#include <glib.h>

#include <condition_variable>
#include <deque>
#include <mutex>
#include <thread>
#include <utility>

namespace vaelo {

struct Worker::State {
  std::mutex mutex;
  std::condition_variable changed;
  std::deque<Job> jobs;                       // guarded by mutex
  std::deque<std::function<void()>> returns;  // guarded by mutex
  bool stopped = false;                       // guarded by mutex
  bool started = false;                       // main thread only

  /// On the main thread.
  void runReturn() {
    std::function<void()> done;
    {
      const std::lock_guard lock(mutex);
      if (stopped || returns.empty()) return;
      done = std::move(returns.front());
      returns.pop_front();
    }
    done();
  }
};

Worker::Worker() : state_(std::make_shared<State>()) {}

Worker::~Worker() {
  // What is dropped here may hold objects whose end calls back.
  std::deque<Job> jobs;
  std::deque<std::function<void()>> returns;
  const std::lock_guard lock(state_->mutex);
  state_->stopped = true;
  jobs.swap(state_->jobs);
  returns.swap(state_->returns);
  state_->changed.notify_one();
}

void Worker::run(Job job) {
  {
    const std::lock_guard lock(state_->mutex);
    state_->jobs.push_back(std::move(job));
    state_->changed.notify_one();
  }
  if (std::exchange(state_->started, true)) return;
  std::thread([state = state_] {
    while (true) {
      Job next;
      {
        std::unique_lock lock(state->mutex);
        state->changed.wait(lock, [&] { return state->stopped || !state->jobs.empty(); });
        if (state->stopped) return;
        next = std::move(state->jobs.front());
        state->jobs.pop_front();
      }
      std::function<void()> done = next();
      next = nullptr;
      if (!done) continue;
      {
        const std::lock_guard lock(state->mutex);
        if (state->stopped) return;
        state->returns.push_back(std::move(done));
      }
      g_idle_add_full(
          G_PRIORITY_DEFAULT,
          [](gpointer data) -> gboolean {
            (*static_cast<std::shared_ptr<State>*>(data))->runReturn();
            return G_SOURCE_REMOVE;
          },
          new std::shared_ptr<State>(state), [](gpointer data) { delete static_cast<std::shared_ptr<State>*>(data); });
    }
  }).detach();
}

}  // namespace vaelo
