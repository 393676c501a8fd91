// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include "platform/application.h"

namespace vaelo {

/// An application loop that is over as soon as its delegate is made.
class MemoryApplication : public Application {
 public:
  static constexpr int ExitStatus = 23;
  bool rightToLeft = false;

  int run(int, char**, std::function<std::shared_ptr<ApplicationDelegate>()> makeDelegate) override {
    return makeDelegate() ? ExitStatus : 0;
  }
  bool isRightToLeft() override { return rightToLeft; }
  std::string description() override { return "application"; }
};

}  // namespace vaelo
