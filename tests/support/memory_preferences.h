// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <map>

#include "platform/preferences.h"

namespace vaelo {

/// Preferences that last as long as the test.
class MemoryPreferences : public Preferences {
 public:
  std::map<std::string, Data> kept;

  std::optional<Data> dataForKey(const std::string& key) override {
    const auto found = kept.find(key);
    return found == kept.end() ? std::nullopt : std::optional(found->second);
  }
  void setDataForKey(const std::string& key, const Data& data) override { kept[key] = data; }
  void removeKey(const std::string& key) override { kept.erase(key); }
};

}  // namespace vaelo
