// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <functional>
#include <map>
#include <memory>
#include <mutex>
#include <string>

#include "platform/value.h"

namespace vaelo {

inline constexpr const char* DidBecomeActiveNotification = "DidBecomeActiveNotification";
inline constexpr const char* WillResignActiveNotification = "WillResignActiveNotification";
inline constexpr const char* IdentityDidChangeNotification = "IdentityDidChangeNotification";
inline constexpr const char* OfferChangedNotification = "OfferChangedNotification";
inline constexpr const char* SyncedStoreDidChangeExternallyNotification = "SyncedStoreDidChangeExternallyNotification";
inline constexpr const char* KeyboardWillShowNotification = "KeyboardWillShowNotification";
inline constexpr const char* KeyboardWillHideNotification = "KeyboardWillHideNotification";

struct Notification {
  std::string name;
  Dictionary userInfo;
};

/// Tells observers of a name, on the thread that posts, in the order in which they began to observe. Safe from any thread.
class NotificationCenter {
 public:
  /// An observation ends when its token is gone.
  using Token = std::shared_ptr<void>;
  [[nodiscard]] Token addObserver(const std::string& name, std::function<void(const Notification&)> handler);
  void post(const Notification& notification);

 private:
  struct Observer;
  std::mutex mutex_;
  std::multimap<std::string, std::weak_ptr<Observer>> observers_;  // guarded by mutex_
};

}  // namespace vaelo
