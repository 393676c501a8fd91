// SPDX-License-Identifier: GPL-3.0-or-later
#include <charconv>

#include "app/nav_controller.h"
#include "fileops/menu_enable_checks.h"
#include "items/vlo_log.h"
#include "platform/platform.h"

namespace vaelo {

namespace {

/// Digits with a decimal point, whatever the process's locale.
double plainNumber(const std::string& text) {
  double number = 0;
  std::from_chars(text.data(), text.data() + text.size(), number);
  return number;
}

}  // namespace

void NavController::quotaFetcherDidUpdateValue(QuotaFetcher&, std::uint64_t freeBytes) {
  quotaBytes_ = freeBytes;
  lastQuotaFetch_ = Platform::current().queues.now();
  VLO_DEBUG("updated quota at %{public}@: %{public}@ bytes avail", *lastQuotaFetch_, freeBytes);
  updateStatusUI(nullptr);
}

std::string NavController::quotaAvailableString() const {
  Formatting& formatting = Platform::current().formatting;
  const std::string withUnit = formatting.byteCount(quotaBytes_, ByteCountStyle::Binary);
  const std::string number = formatting.byteCount(quotaBytes_, ByteCountStyle::Binary, false);
  return formatting.localizedAmount(".DICT.AVAILABLE.%g", plainNumber(number), withUnit);
}

std::string NavController::toolbarStatusText(std::size_t itemCount) const {
  Formatting& formatting = Platform::current().formatting;
  const std::string items = formatting.localizedCount(".DICT.ITEMS.%d", static_cast<std::int64_t>(itemCount));
  if (!okToShowQuota()) return items;
  return formatting.filled(formatting.localizedString("%1$@, %2$@"), {items, quotaAvailableString()});
}

void NavController::documentListControllerItemsChanged(const DocumentListControllerRef& list) {
  // One for all lists: it only keeps the log from repeating itself.
  static std::size_t lastLoggedCount = 0;
  pickerIsAlive_ = true;
  if (list != getTopDocumentListController()) return;
  if (editMode_) {
    VLO_DEBUG("DLC selected item count is %{public}@", list->selectedItemCount());
  } else if (list->containedItems().size() != lastLoggedCount) {
    lastLoggedCount = list->containedItems().size();
    VLO_DEBUG("DLC items changed, count is %{public}@", lastLoggedCount);
  }
  updateStatusUI(list);
}

void NavController::updateStatusUI(DocumentListControllerRef list) {
  if (!pickerIsAlive_) return;
  if (!list) list = getTopDocumentListController();
  if (!list) return;
  if (const StatusBarRef bar = statusBarOf(*list)) {
    bar->setStatusText(toolbarStatusText(list->containedItems().size()));
    bar->showUpgradeOffer(upgradeOffer_);
  }
  if (!editMode_) return;
  Formatting& formatting = Platform::current().formatting;
  const std::size_t selected = list->selectedItemCount();
  list->navigationItem().setTitle(
      selected > 0 ? formatting.localizedCount(".DICT.ITEMS_SELECTED.%d", static_cast<std::int64_t>(selected))
                   : formatting.localizedString("Select Items"));
  if (barButtonMoveItem_) barButtonMoveItem_->setEnabled(MenuEnableChecks::canShowMoveForSelectedItems(*list));
  if (barButtonDeleteItem_) barButtonDeleteItem_->setEnabled(MenuEnableChecks::canShowDeleteForSelectedItems(*list));
}

}  // namespace vaelo
