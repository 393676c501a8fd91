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
  std::deque<Job> jobs;    // guarded by mutex
  bool stopped = false;    // guarded by mutex
  bool abandoned = false;  // main thread only
  bool started = false;    // main thread only
};

namespace {

struct Return {
  std::function<void()> run;
};

}  // namespace

Worker::Worker() : state_(std::make_shared<State>()) {}

Worker::~Worker() {
  state_->abandoned = true;
  const std::lock_guard lock(state_->mutex);
  state_->stopped = true;
  state_->jobs.clear();
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
      auto* back = new Return{[state, done = std::move(done)] {
        if (!state->abandoned) done();
      }};
      g_idle_add_full(
          G_PRIORITY_DEFAULT,
          [](gpointer data) -> gboolean {
            static_cast<Return*>(data)->run();
            return G_SOURCE_REMOVE;
          },
          back, [](gpointer data) { delete static_cast<Return*>(data); });
    }
  }).detach();
}

}  // namespace vaelo
