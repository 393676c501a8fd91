// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <string>
#include <vector>

#include "platform/logging.h"

namespace vaelo {

/// Keeps what the user did. Main thread.
class MemoryActivityTracing : public ActivityTracing {
 public:
  std::vector<std::string> userActions;
  void recordUserAction(const std::string& label) override { userActions.push_back(label); }
};

}  // namespace vaelo
