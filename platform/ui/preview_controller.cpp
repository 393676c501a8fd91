// SPDX-License-Identifier: GPL-3.0-or-later
#include "platform/ui/preview_controller.h"

#include <utility>

namespace vaelo {

void PreviewController::reloadData() { previewChanged_.emit(*this, PreviewChange::AllItems); }

void PreviewController::refreshCurrentPreviewItem() { previewChanged_.emit(*this, PreviewChange::CurrentItem); }

void PreviewController::setAdditionalRightBarButtonItems(std::vector<BarButtonItemRef> items) {
  additionalItems_ = std::move(items);
  previewChanged_.emit(*this, PreviewChange::BarButtonItems);
}

std::size_t PreviewController::itemCount() {
  const auto asked = dataSource();
  return asked ? asked->numberOfPreviewItemsInPreviewController(*this) : 0;
}

URL PreviewController::itemAtIndex(std::size_t index) {
  return dataSource()->previewControllerPreviewItemAtIndex(*this, index);
}

bool PreviewController::canEditItem(const URL& item) {
  const auto asked = delegate();
  return asked && asked->previewControllerCanEditItem(*this, item);
}

bool PreviewController::shouldSaveEditedItem(const URL& item) {
  const auto asked = delegate();
  return asked && asked->previewControllerShouldSaveEditedItem(*this, item);
}

}  // namespace vaelo
