// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include "platform/queues.h"

namespace vaelo {

/// Time and threads on GLib: the main queue is the default main context, a serial queue a thread that lives while there is
/// work or a delay, an operation queue up to two threads.
class GLibQueues : public Queues {
 public:
  GLibQueues();
  ~GLibQueues() override;
  DispatchQueue& main() override;
  std::shared_ptr<DispatchQueue> makeSerialQueue(const std::string& label) override;
  std::shared_ptr<OperationQueue> makeOperationQueue(const std::string& name, QualityOfService quality) override;
  std::unique_ptr<TimerSource> makeTimer(std::shared_ptr<DispatchQueue> queue, std::chrono::nanoseconds interval,
                                         std::chrono::nanoseconds leeway, Block handler) override;
  Date now() override { return std::chrono::system_clock::now(); }

 private:
  std::unique_ptr<DispatchQueue> main_;
};

}  // namespace vaelo
