// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <functional>
#include <memory>
#include <utility>

namespace vaelo {

/// Calls its action when the view that it is added to is tapped. Main thread.
class TapGestureRecognizer {
 public:
  explicit TapGestureRecognizer(std::function<void()> action) : action_(std::move(action)) {}
  bool enabled() const { return enabled_; }
  void setEnabled(bool enabled) { enabled_ = enabled; }
  /// For the host: a tap that no control took.
  void recognize() {
    if (enabled_ && action_) action_();
  }

 private:
  std::function<void()> action_;
  bool enabled_ = true;
};

using TapGestureRecognizerRef = std::shared_ptr<TapGestureRecognizer>;

}  // namespace vaelo
