// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <chrono>
#include <map>
#include <mutex>

#include "platform/queues.h"

namespace vaelo {

/// The virtual clock of all queues in memory: what is due runs on the thread that advances the clock, in the order of its
/// time, then of its coming. post() is safe from any thread.
class MemoryClock {
 public:
  void post(std::chrono::nanoseconds delay, Block block);
  /// Runs what is due until `time` from now, also what that posts itself.
  void advance(std::chrono::nanoseconds time);
  /// Goes on to the next block, however late, and runs it; false when there is none.
  bool runNext();
  /// Drops the blocks that have not run: they may keep objects alive that keep the clock.
  void forgetWhatIsLeft();
  Date date() const;

  /// The wall clock's time at the start.
  Date origin;

 private:
  bool runOneBefore(std::chrono::nanoseconds end);

  mutable std::mutex mutex_;
  std::chrono::nanoseconds now_{};                         // guarded by mutex_
  std::multimap<std::chrono::nanoseconds, Block> blocks_;  // guarded by mutex_
};

}  // namespace vaelo
