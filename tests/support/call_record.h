// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <algorithm>
#include <string>
#include <vector>

#include "platform/resource_values.h"

namespace vaelo {

/// What was asked of the platform, in order, as "operation path".
struct CallRecord {
  std::vector<std::string> calls;
  std::vector<ResourceKey> lastKeys;  ///< of the last read or walk
  unsigned lastOptions = 0;           ///< of the last coordinated read or walk

  /// Position of a call; -1 when it was not made.
  int indexOf(const std::string& call) const {
    const auto at = std::find(calls.begin(), calls.end(), call);
    return at == calls.end() ? -1 : static_cast<int>(at - calls.begin());
  }
  bool has(const std::string& call) const { return indexOf(call) >= 0; }
};

}  // namespace vaelo
