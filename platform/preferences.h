// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <optional>
#include <string>

#include "platform/value.h"

namespace vaelo {

/// The user's preferences: few, small, kept across starts. Main thread. A write survives a crash whole or not at all.
class Preferences {
 public:
  virtual ~Preferences() = default;
  virtual std::optional<Data> dataForKey(const std::string& key) = 0;
  virtual void setDataForKey(const std::string& key, const Data& data) = 0;
  virtual void removeKey(const std::string& key) = 0;
};

}  // namespace vaelo
