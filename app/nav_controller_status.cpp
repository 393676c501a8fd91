// SPDX-License-Identifier: GPL-3.0-or-later
// The bars of a list: title, back button, and the status line.
#include <cstdlib>

#include "app/nav_controller.h"
#include "app/status_bar.h"
#include "items/vlo_log.h"
#include "platform/platform.h"

namespace vaelo {

void NavController::configureNavBar(const DocumentListControllerRef& list) {
  NavigationItem& item = list->navigationItem();
  item.setHidesBackButton(editMode_, false);
  item.setTitle(editMode_ ? Platform::current().formatting.localizedString("Select Items") : viewTitle_);
}

void NavController::configureToolbar(const DocumentListControllerRef& list) {
  std::shared_ptr<DocumentListControllerStatusBar> statusBar = DocumentListControllerStatusBar::of(*list);
  if (!statusBar) {
    statusBar = std::make_shared<DocumentListControllerStatusBar>();
    DocumentListControllerStatusBar::attachTo(*list, statusBar);
  }
  if (list->toolbarItems() != statusBar->toolbarItems()) list->setToolbarItems(statusBar->toolbarItems());
  updateStatusUI(list);
}

void NavController::documentListControllerItemsChanged(const DocumentListControllerRef& list) {
  pickerIsAlive_ = true;
  if (list != topViewController()) return;
  if (editMode_) {
    VLO_DEBUG("DLC selected item count is %{public}@", list->selectedItems().size());
  } else {
    // One count for all lists: only a change is worth a line.
    static std::size_t lastLoggedCount = 0;
    const std::size_t count = list->containedItems().size();
    if (count != lastLoggedCount) {
      lastLoggedCount = count;
      VLO_DEBUG("DLC items changed, count is %{public}@", count);
    }
  }
  updateStatusUI(list);
}

void NavController::updateStatusUI(DocumentListControllerRef list) {
  if (!pickerIsAlive_) return;
  if (!list) list = getTopDocumentListController();
  if (!list) return;
  if (const auto statusBar = DocumentListControllerStatusBar::of(*list)) {
    statusBar->setStatusText(toolbarStatusText(list->containedItems().size()));
  }
}

void NavController::quotaFetcherDidUpdateValue(QuotaFetcher&, std::uint64_t freeBytes) {
  quotaBytes_ = freeBytes;
  lastQuotaFetch_ = Platform::current().queues.now();
  VLO_DEBUG("updated quota at %{public}@: %{public}@ bytes avail", *lastQuotaFetch_, freeBytes);
  updateStatusUI(nullptr);
}

std::string NavController::toolbarStatusText(std::size_t itemCount) const {
  Formatting& formatting = Platform::current().formatting;
  const std::string items = formatting.localizedCount(".DICT.ITEMS.%d", static_cast<std::int64_t>(itemCount));
  if (!okToShowQuota()) return items;
  return formatting.filled(formatting.localizedString("%1$@, %2$@"), {items, quotaAvailableString()});
}

std::string NavController::quotaAvailableString() const {
  Formatting& formatting = Platform::current().formatting;
  const std::string withUnit = formatting.byteCount(quotaBytes_, ByteCountStyle::Binary);
  const std::string number = formatting.byteCount(quotaBytes_, ByteCountStyle::Binary, false);
  return formatting.localizedAmount(".DICT.AVAILABLE.%g", std::strtod(number.c_str(), nullptr), withUnit);
}

}  // namespace vaelo
