// SPDX-License-Identifier: GPL-3.0-or-later
#include "tests/support/memory_clock.h"

#include <algorithm>

namespace vaelo {

void MemoryClock::post(std::chrono::nanoseconds delay, Block block) {
  const std::lock_guard lock(mutex_);
  blocks_.emplace(now_ + delay, std::move(block));
}

bool MemoryClock::runOneBefore(std::chrono::nanoseconds end) {
  Block block;
  {
    const std::lock_guard lock(mutex_);
    if (blocks_.empty() || blocks_.begin()->first > end) return false;
    now_ = std::max(now_, blocks_.begin()->first);
    block = std::move(blocks_.begin()->second);
    blocks_.erase(blocks_.begin());
  }
  block();
  return true;
}

void MemoryClock::advance(std::chrono::nanoseconds time) {
  std::chrono::nanoseconds end;
  {
    const std::lock_guard lock(mutex_);
    end = now_ + time;
  }
  while (runOneBefore(end)) {
  }
  const std::lock_guard lock(mutex_);
  now_ = std::max(now_, end);
}

bool MemoryClock::runNext() { return runOneBefore(std::chrono::nanoseconds::max()); }

Date MemoryClock::date() const {
  const std::lock_guard lock(mutex_);
  return origin + std::chrono::duration_cast<Date::duration>(now_);
}

void MemoryClock::forgetWhatIsLeft() {
  std::multimap<std::chrono::nanoseconds, Block> left;
  {
    const std::lock_guard lock(mutex_);
    left.swap(blocks_);
  }
}

}  // namespace vaelo
