// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <functional>
#include <memory>
#include <string>
#include <utility>
#include <vector>

#include "platform/ui/navigation_host.h"
#include "platform/ui/presentation_host.h"

namespace vaelo {

/// Shows everything at once, unless a test wants dismissals to take their time, and keeps what was to be animated.
class AnimationRecorder : public NavigationHost, public PresentationHost {
 public:
  void stackChanged(const Stack&, const Stack&, bool animated, std::function<void()> done) override {
    stacks.push_back(animated);
    changes.push_back(animated ? "stack, animated" : "stack");
    done();
  }
  void toolbarHiddenChanged(bool, bool) override {}
  void present(const std::shared_ptr<ViewController>&, const std::shared_ptr<ViewController>&, bool animated,
               std::function<void()> done) override {
    changes.push_back(animated ? "present, animated" : "present");
    done();
  }
  void dismiss(const std::shared_ptr<ViewController>&, bool animated, std::function<void()> done) override {
    dismissals.push_back(animated);
    changes.push_back(animated ? "dismiss, animated" : "dismiss");
    if (holdsDismissals) {
      held.push_back(std::move(done));
    } else {
      done();
    }
  }
  /// What was dismissed is gone.
  void finishDismissals() {
    for (const std::function<void()>& done : std::exchange(held, {})) done();
  }

  std::vector<bool> stacks;
  std::vector<bool> dismissals;
  std::vector<std::string> changes;  ///< of the stack and of what is presented, in their order
  bool holdsDismissals = false;
  std::vector<std::function<void()>> held;
};

}  // namespace vaelo
