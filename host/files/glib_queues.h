// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include "platform/queues.h"

namespace vaelo {

/// Time and threads on GLib: the main queue is the default main context, a serial queue one thread from its first block on,
/// an operation queue up to two threads, which give way to others when nobody waits for their work. A queue that is let go
/// of runs what was given to it at once, but not what was delayed.
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
