// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <functional>
#include <memory>
#include <vector>

namespace vaelo {

class ViewController;

/// Shows the stack of a navigation controller. Main thread. The model has changed already when it is called.
class NavigationHost {
 public:
  using Stack = std::vector<std::shared_ptr<ViewController>>;
  virtual ~NavigationHost() = default;
  /// The stack was `oldStack` and is `newStack`; `done` must be called once when the top one stands, at once if no animation
  /// is wanted.
  virtual void stackChanged(const Stack& oldStack, const Stack& newStack, bool animated, std::function<void()> done) = 0;
  virtual void toolbarHiddenChanged(bool hidden, bool animated) = 0;
};

}  // namespace vaelo
