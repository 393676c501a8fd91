// SPDX-License-Identifier: GPL-3.0-or-later
#include "platform/ui/control.h"

namespace vaelo {

void Control::setEnabled(bool enabled) {
  if (enabled_ == enabled) return;
  enabled_ = enabled;
  notify(ViewChange::Interaction);
}

void Control::addAction(ControlEvent event, std::function<void()> action) {
  actions_.emplace_back(event, std::move(action));
}

void Control::sendActions(ControlEvent event) {
  if (!enabled_) return;
  const ViewRef kept = weak_from_this().lock();
  const auto actions = actions_;
  for (const auto& [when, action] : actions) {
    if (when == event) action();
  }
}

}  // namespace vaelo
