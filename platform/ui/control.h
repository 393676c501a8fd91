// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <functional>
#include <utility>
#include <vector>

#include "platform/ui/view.h"

namespace vaelo {

enum class ControlEvent { TouchUpInside, EditingChanged };

/// A view that the user acts on. Main thread.
class Control : public View {
 public:
  using View::View;
  bool enabled() const { return enabled_; }
  void setEnabled(bool enabled);
  /// Adds an action; actions run in the order in which they were added.
  void addAction(ControlEvent event, std::function<void()> action);
  void removeAllActions() { actions_.clear(); }
  /// For the host, and for tests: the event happened. A disabled control ignores it.
  void sendActions(ControlEvent event);

 private:
  bool enabled_ = true;
  std::vector<std::pair<ControlEvent, std::function<void()>>> actions_;
};

}  // namespace vaelo
