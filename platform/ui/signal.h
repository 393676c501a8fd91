// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <algorithm>
#include <functional>
#include <memory>
#include <utility>
#include <vector>

namespace vaelo {

/// Tells listeners of changes, in the order in which they began to listen. Main thread. A listener may connect or
/// disconnect others while being told.
template <typename... Args>
class Signal {
 public:
  using Listener = std::function<void(Args...)>;
  /// Listening ends when the token is gone.
  using Token = std::shared_ptr<void>;

  [[nodiscard]] Token connect(Listener listener) {
    auto held = std::make_shared<Listener>(std::move(listener));
    std::erase_if(listeners_, [](const auto& weak) { return weak.expired(); });
    listeners_.push_back(held);
    return held;
  }

  void emit(Args... args) const {
    const auto listeners = listeners_;
    for (const auto& weak : listeners) {
      if (auto listener = weak.lock()) (*listener)(args...);
    }
  }

 private:
  std::vector<std::weak_ptr<Listener>> listeners_;
};

}  // namespace vaelo
