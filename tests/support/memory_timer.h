// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <memory>

#include "tests/support/memory_clock.h"

namespace vaelo {

/// A periodic timer that is never late.
class MemoryTimer : public TimerSource {
 public:
  MemoryTimer(std::shared_ptr<DispatchQueue> queue, std::chrono::nanoseconds interval, Block handler)
      : handler_(std::make_shared<Block>(std::move(handler))) {
    queue->async(
        [weak = std::weak_ptr(queue), interval, handler = std::weak_ptr(handler_)] { fire(weak, interval, handler); });
  }

  /// Expires when the timer is cancelled.
  std::weak_ptr<const void> life() const { return handler_; }

 private:
  static void fire(const std::weak_ptr<DispatchQueue>& weakQueue, std::chrono::nanoseconds interval,
                   const std::weak_ptr<Block>& weakHandler) {
    const auto queue = weakQueue.lock();
    const auto handler = weakHandler.lock();
    if (!queue || !handler) return;
    queue->after(interval, [weakQueue, interval, weakHandler] { fire(weakQueue, interval, weakHandler); });
    (*handler)();
  }
  std::shared_ptr<Block> handler_;
};

}  // namespace vaelo
