// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <string>

#include "platform/value.h"

namespace vaelo {

/// Small values that follow the account. SyncedStoreDidChangeExternallyNotification tells of changes from elsewhere.
class SyncedKeyValueStore {
 public:
  virtual ~SyncedKeyValueStore() = default;
  /// Absent when there is no such key. Any thread.
  virtual Value objectForKey(const std::string& key) = 0;
};

}  // namespace vaelo
