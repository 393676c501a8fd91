// SPDX-License-Identifier: GPL-3.0-or-later
#include "platform/notifications.h"

#include <vector>

namespace vaelo {

struct NotificationCenter::Observer {
  std::function<void(const Notification&)> handler;
};

NotificationCenter::Token NotificationCenter::addObserver(const std::string& name,
                                                          std::function<void(const Notification&)> handler) {
  auto observer = std::make_shared<Observer>(Observer{std::move(handler)});
  const std::lock_guard lock(mutex_);
  observers_.emplace(name, observer);
  return observer;
}

void NotificationCenter::post(const Notification& notification) {
  // Weak, since a handler may end an observation that would come after it.
  std::vector<std::weak_ptr<Observer>> called;
  {
    const std::lock_guard lock(mutex_);
    auto [at, end] = observers_.equal_range(notification.name);
    while (at != end) {
      if (!at->second.expired()) {
        called.push_back(at->second);
        ++at;
      } else {
        at = observers_.erase(at);
      }
    }
  }
  for (const std::weak_ptr<Observer>& observer : called) {
    if (const auto alive = observer.lock()) alive->handler(notification);
  }
}

}  // namespace vaelo
