// SPDX-License-Identifier: GPL-3.0-or-later
#include "platform/ui/alert_action.h"

namespace vaelo {

AlertActionRef AlertAction::make(std::string title, AlertActionStyle style, Handler handler) {
  AlertActionRef action(new AlertAction);
  action->title_ = std::move(title);
  action->style_ = style;
  action->handler_ = std::move(handler);
  return action;
}

void AlertAction::setEnabled(bool enabled) {
  if (enabled_ == enabled) return;
  enabled_ = enabled;
  changed_.emit(*this);
}

}  // namespace vaelo
