// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <chrono>
#include <functional>
#include <memory>
#include <string>

#include "platform/date.h"

namespace vaelo {

using Block = std::function<void()>;

/// Runs blocks one after the other, in the order they came. async and after are safe from any thread.
class DispatchQueue {
 public:
  virtual ~DispatchQueue() = default;
  virtual void async(Block block) = 0;
  virtual void after(std::chrono::nanoseconds delay, Block block) = 0;
  virtual std::string label() const = 0;
};

enum class QualityOfService { Default, UserInitiated, Utility, Background };

/// Runs operations, possibly several at a time. addOperation is safe from any thread; destruction waits for what runs.
class OperationQueue {
 public:
  virtual ~OperationQueue() = default;
  virtual void addOperation(Block operation) = 0;
  virtual std::string name() const = 0;
  virtual QualityOfService qualityOfService() const = 0;
};

/// A periodic timer; destruction cancels it, after which its handler does not begin again.
class TimerSource {
 public:
  virtual ~TimerSource() = default;
};

/// Time and threads.
class Queues {
 public:
  virtual ~Queues() = default;
  /// The queue of the main thread.
  virtual DispatchQueue& main() = 0;
  virtual std::shared_ptr<DispatchQueue> makeSerialQueue(const std::string& label) = 0;
  virtual std::shared_ptr<OperationQueue> makeOperationQueue(const std::string& name, QualityOfService quality) = 0;
  /// Calls `handler` on `queue` first now, then every `interval`; each firing may come up to `leeway` late.
  virtual std::unique_ptr<TimerSource> makeTimer(std::shared_ptr<DispatchQueue> queue, std::chrono::nanoseconds interval,
                                                 std::chrono::nanoseconds leeway, Block handler) = 0;
  virtual Date now() = 0;
};

}  // namespace vaelo
