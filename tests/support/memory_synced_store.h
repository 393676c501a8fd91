// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <string>

#include "platform/synced_key_value_store.h"

namespace vaelo {

/// Holds what a test puts into it.
class MemorySyncedStore : public SyncedKeyValueStore {
 public:
  Value objectForKey(const std::string& key) override {
    const auto found = values.find(key);
    return found == values.end() ? Value() : found->second;
  }
  Dictionary values;
};

}  // namespace vaelo
