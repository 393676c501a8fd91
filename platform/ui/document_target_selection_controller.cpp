// SPDX-License-Identifier: GPL-3.0-or-later
#include "platform/ui/document_target_selection_controller.h"

#include <utility>

namespace vaelo {

DocumentTargetSelectionController::DocumentTargetSelectionController(std::vector<URL> itemsToMove, bool crossContainer)
    : itemsToMove_(std::move(itemsToMove)), crossContainer_(crossContainer) {}

void DocumentTargetSelectionController::userSelected(const URL& folder) {
  if (const auto told = delegate()) told->documentTargetSelectionControllerDidSelectItemAtURL(sharedSelf(this), folder);
}

void DocumentTargetSelectionController::userCancelled() { dismissViewControllerAnimated(true); }

}  // namespace vaelo
