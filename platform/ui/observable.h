// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <functional>
#include <memory>
#include <vector>

namespace vaelo {

/// Tells whoever mirrors an object that a property of it changed. Main thread.
class Observable {
 public:
  using Token = std::shared_ptr<std::function<void()>>;
  /// `changed` is called after each change, until the token is gone.
  [[nodiscard]] Token observe(std::function<void()> changed) {
    auto token = std::make_shared<std::function<void()>>(std::move(changed));
    observers_.push_back(token);
    return token;
  }

 protected:
  ~Observable() = default;
  void notifyChanged();
  /// Sets `property` and notifies, unless it is equal already.
  template <typename T, typename V>
  void set(T& property, V&& value) {
    if (property == value) return;
    property = std::forward<V>(value);
    notifyChanged();
  }

 private:
  std::vector<std::weak_ptr<std::function<void()>>> observers_;
};

}  // namespace vaelo
