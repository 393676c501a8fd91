// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <memory>

#include "tests/support/memory_clock.h"

namespace vaelo {

/// A serial queue on the virtual clock.
class MemoryDispatchQueue : public DispatchQueue {
 public:
  MemoryDispatchQueue(std::shared_ptr<MemoryClock> clock, std::string label)
      : clock_(std::move(clock)), label_(std::move(label)) {}
  void async(Block block) override { clock_->post({}, std::move(block)); }
  void after(std::chrono::nanoseconds delay, Block block) override { clock_->post(delay, std::move(block)); }
  std::string label() const override { return label_; }

 private:
  std::shared_ptr<MemoryClock> clock_;
  std::string label_;
};

}  // namespace vaelo
