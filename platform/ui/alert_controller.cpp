// SPDX-License-Identifier: GPL-3.0-or-later
#include "platform/ui/alert_controller.h"

#include <algorithm>
#include <utility>

namespace vaelo {

AlertController::AlertController(AlertStyle style, const std::string& title, std::string message)
    : style_(style), message_(std::move(message)) {
  setTitle(title);
}

void AlertController::addAction(AlertActionRef action) {
  actions_.push_back(std::move(action));
  notify(ViewControllerChange::View);
}

void AlertController::addTextField(const std::function<void(const std::shared_ptr<TextField>&)>& configure) {
  auto field = std::make_shared<TextField>();
  if (configure) configure(field);
  textFields_.push_back(field);
  if (isViewLoaded()) view()->addSubview(field);
  notify(ViewControllerChange::View);
}

void AlertController::setContentViewController(ViewControllerRef controller) {
  if (contentViewController_ == controller) return;
  if (contentViewController_) {
    if (contentViewController_->isViewLoaded()) contentViewController_->view()->removeFromSuperview();
    contentViewController_->removeFromParent();
  }
  contentViewController_ = std::move(controller);
  if (contentViewController_) {
    addChild(contentViewController_);
    if (isViewLoaded()) view()->addSubview(contentViewController_->view());
    contentViewController_->didMoveToParent(this);
  }
  notify(ViewControllerChange::View);
}

void AlertController::viewDidLoad() {
  for (const std::shared_ptr<TextField>& field : textFields_) view()->addSubview(field);
  if (contentViewController_) view()->addSubview(contentViewController_->view());
}

bool AlertController::performAction(const AlertActionRef& action) {
  const AlertActionRef chosen = action;
  const ViewControllerRef kept = shared_from_this();
  if (!chosen->enabled() || std::find(actions_.begin(), actions_.end(), chosen) == actions_.end()) return false;
  if (chosen->shouldDismiss() && !chosen->shouldDismiss()()) return false;
  dismissSelf(true);
  if (chosen->handler()) chosen->handler()(chosen);
  return true;
}

bool AlertController::cancel() {
  for (const AlertActionRef& action : actions_) {
    if (action->style() == AlertActionStyle::Cancel) return performAction(action);
  }
  return false;
}

}  // namespace vaelo
