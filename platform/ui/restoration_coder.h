// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <map>
#include <string>

#include "platform/value.h"

namespace vaelo {

/// Holds a screen's state between two runs, by key. Only strings, integers and URLs survive.
class RestorationCoder {
 public:
  void encode(const std::string& key, Value value) { values_[key] = std::move(value); }
  /// Absent when nothing was encoded under the key.
  Value decode(const std::string& key) const {
    const auto found = values_.find(key);
    return found == values_.end() ? Value() : found->second;
  }
  const Dictionary& values() const { return values_; }

 private:
  Dictionary values_;
};

}  // namespace vaelo
