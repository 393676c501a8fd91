// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <glib.h>

#include <atomic>
#include <chrono>
#include <functional>
#include <string>

namespace vaelo {

/// Keeps the window alive while the main thread waits for something long, such as a copy from disk to disk or thousands of
/// renames: its caller needs the answer before it goes on, so the main loop runs inside of the call. A row of such calls is
/// one piece of work to whoever watches. The main loop's own calls only; from other threads work runs where it is asked for.
class LongWork {
 public:
  /// Ends early when `goOn`, which may be asked from its thread at any time, answers false.
  using Job = std::function<int(const std::function<bool()>& goOn)>;
  enum class Kind { Move, Removal };
  /// Hears what is worked on, a path, as soon as it takes longer than a moment, and at the end nothing.
  using Watcher = std::function<void(Kind, const std::string* path)>;

  /// `isUnderWay` hears of the beginning and the end of each piece of work that the main loop ran inside of.
  LongWork(std::function<void(bool)> isUnderWay, std::chrono::milliseconds moment = std::chrono::milliseconds(50))
      : isUnderWay_(std::move(isUnderWay)), moment_(moment) {}
  ~LongWork();
  LongWork(const LongWork&) = delete;
  LongWork& operator=(const LongWork&) = delete;

  /// A move from disk to disk. Answers what the job answers.
  int run(const std::string& path, const Job& job);
  /// Comes before each of what may be thousands of quick calls: the main loop runs in between as soon as they take longer
  /// together than a moment. False where the rest of the row is not to be done.
  bool step(const std::string& path, Kind kind);
  /// Ends what is under way, and all that comes before the main loop is itself again. Main thread.
  void cancel() { cancelled_ = true; }
  bool isCancelled() const { return cancelled_; }
  /// Main thread.
  void setWatcher(Watcher watcher) { watcher_ = std::move(watcher); }

 private:
  using Clock = std::chrono::steady_clock;
  void begin(const std::string& path, Kind kind);
  void waitForMore();
  void end();

  std::function<void(bool)> isUnderWay_;
  const std::chrono::milliseconds moment_;
  Watcher watcher_;
  Clock::time_point since_{};  ///< when the main loop last was itself, as far as this knows
  unsigned depth_ = 0;         ///< calls of run() within each other
  bool shown_ = false;
  guint endTimer_ = 0;
  std::atomic<bool> cancelled_ = false;
};

}  // namespace vaelo
