// SPDX-License-Identifier: GPL-3.0-or-later
#include "platform/ui/alert_controller.h"

namespace vaelo {

std::shared_ptr<TextField> AlertController::addTextField() {
  textFields_.push_back(std::make_shared<TextField>());
  return textFields_.back();
}

void AlertController::press(const std::shared_ptr<AlertAction>& action) {
  if (!action->isEnabled()) return;
  const ViewControllerRef keep = shared_from_this();
  const bool closes = !action->shouldDismiss_ || action->shouldDismiss_();
  if (closes) {
    if (const ViewControllerRef presenting = presentingViewController()) presenting->dismissViewController(true);
  }
  if (action->handler_) action->handler_();
}

}  // namespace vaelo
