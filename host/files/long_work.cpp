// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/files/long_work.h"

#include <condition_variable>
#include <mutex>
#include <thread>
#include <utility>

namespace vaelo {

namespace {

/// What the job's thread and the one that waits share.
struct Outcome {
  std::mutex mutex;
  std::condition_variable changed;
  bool done = false;  // guarded by mutex
  int answer = 0;     // guarded by mutex

  bool isDone() {
    const std::lock_guard lock(mutex);
    return done;
  }
};

}  // namespace

LongWork::~LongWork() {
  if (endTimer_) g_source_remove(endTimer_);
}

int LongWork::run(const std::string& path, const Job& job) {
  if (!g_main_context_is_owner(nullptr)) return job([] { return true; });
  const bool isFirst = endTimer_ == 0 && depth_ == 0;
  if (isFirst) since_ = Clock::now();
  if (endTimer_) g_source_remove(endTimer_);
  endTimer_ = 0;
  ++depth_;
  Outcome outcome;
  std::thread thread([&] {
    const int answer = job([this] { return !cancelled_; });
    const std::lock_guard lock(outcome.mutex);
    outcome.answer = answer;
    outcome.done = true;
    outcome.changed.notify_one();
    g_main_context_wakeup(nullptr);
  });
  {
    std::unique_lock lock(outcome.mutex);
    outcome.changed.wait_until(lock, since_ + moment_, [&] { return outcome.done; });
  }
  if (Clock::now() >= since_ + moment_) {
    begin(path, Kind::Move);
    while (!outcome.isDone()) g_main_context_iteration(nullptr, TRUE);
    g_main_context_iteration(nullptr, FALSE);
    since_ = Clock::now();
  }
  thread.join();
  if (--depth_ == 0) waitForMore();
  return outcome.answer;
}

bool LongWork::step(const std::string& path, Kind kind) {
  if (!g_main_context_is_owner(nullptr) || depth_ != 0) return !cancelled_;
  if (endTimer_ == 0) {
    since_ = Clock::now();
    waitForMore();
  }
  // Half of it, since what comes next takes its time too.
  if (Clock::now() < since_ + moment_ / 2) return !cancelled_;
  g_source_remove(std::exchange(endTimer_, 0));
  ++depth_;
  begin(path, kind);
  constexpr int manyTurns = 50;
  for (int turn = 0; turn < manyTurns && g_main_context_iteration(nullptr, FALSE); ++turn) {
  }
  since_ = Clock::now();
  --depth_;
  waitForMore();
  return !cancelled_;
}

void LongWork::begin(const std::string& path, Kind kind) {
  if (!shown_) isUnderWay_(true);
  shown_ = true;
  if (watcher_) watcher_(kind, &path);
}

/// The caller may have more to do; what it does next comes before the timer.
void LongWork::waitForMore() {
  endTimer_ = g_timeout_add(
      static_cast<guint>(moment_.count()),
      [](gpointer self) -> gboolean {
        static_cast<LongWork*>(self)->end();
        return G_SOURCE_REMOVE;
      },
      this);
}

void LongWork::end() {
  endTimer_ = 0;
  cancelled_ = false;
  if (!shown_) return;
  shown_ = false;
  if (watcher_) watcher_(Kind::Move, nullptr);
  isUnderWay_(false);
}

}  // namespace vaelo
