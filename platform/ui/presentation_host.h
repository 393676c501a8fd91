// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <functional>
#include <memory>

namespace vaelo {

class ViewController;

/// Shows presented screens over a window's content. Main thread. The model has changed already when it is called.
class PresentationHost {
 public:
  virtual ~PresentationHost() = default;
  /// Shows `presented`; `done` is called once when it stands.
  virtual void present(const std::shared_ptr<ViewController>& presenter, const std::shared_ptr<ViewController>& presented,
                       bool animated, std::function<void()> done) = 0;
  /// Takes it away; `done` is called once when it is gone.
  virtual void dismiss(const std::shared_ptr<ViewController>& presented, bool animated, std::function<void()> done) = 0;
};

}  // namespace vaelo
