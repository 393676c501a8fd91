// SPDX-License-Identifier: GPL-3.0-or-later
#include "platform/ui/preview_controller.h"

namespace vaelo {

void PreviewController::reloadData() {
  if (renderer_) renderer_->reloadData();
}

void PreviewController::refreshCurrentPreviewItem() {
  if (renderer_) renderer_->refreshCurrentPreviewItem();
}

}  // namespace vaelo
