// SPDX-License-Identifier: GPL-3.0-or-later
#include "app/nav_controller.h"
#include "fileops/menu_enable_checks.h"
#include "items/vlo_log.h"
#include "platform/localized.h"
#include "platform/platform.h"
#include "platform/ui/button.h"

namespace vaelo {

void NavController::beginEditMode(const BarButtonItemRef&) {
  VLO_USER_ACTION("Pressed Select (begin edit)");
  VLO_INFO("Begin Edit mode");
  setEditModeAndUpdateUIForViewController(true, getTopDocumentListController());
}

void NavController::endEditMode(const BarButtonItemRef&) {
  VLO_USER_ACTION("Pressed Cancel (end edit)");
  const DocumentListControllerRef list = getTopDocumentListController();
  VLO_DEBUG("EndEditMode.  Selected %d items: %@", list ? list->selectedItemCount() : 0,
            list ? list->selectedItems() : std::vector<URL>());
  setEditModeAndUpdateUIForViewController(false, list);
}

void NavController::selectAllItems(const BarButtonItemRef&) {
  VLO_USER_ACTION("Pressed SelectAll");
  VLO_INFO("Pressed SelectAll");
  const DocumentListControllerRef list = getTopDocumentListController();
  if (!list) return;
  VLO_DEBUG("DLC has %d contained items", list->containedItems().size());
  list->selectAllItems();
  VLO_DEBUG("Selected all %d: %@", list->selectedItemCount(), list->selectedItems());
}

void NavController::setEditModeAndUpdateUIForViewController(bool edit, const DocumentListControllerRef& list) {
  editMode_ = edit;
  if (list) list->setEditingAnimated(edit, true);
  configureVisibleControllerForMode();
  if (editMode_ && list && barButtonNewFolder_) {
    barButtonNewFolder_->setEnabled(MenuEnableChecks::canEnableNewFolderForSelectedItems(*list));
  }
}

void NavController::configureVisibleControllerForMode() {
  const DocumentListControllerRef list = getTopDocumentListController();
  if (!list) return;
  configureNavBar(list);
  configureToolbar(list);
  updateStatusUI(list);
}

void NavController::configureNavBar(const DocumentListControllerRef& list) {
  NavigationItem& bar = list->navigationItem();
  const auto calls = [weak = weakSelf(this)](void (NavController::*action)(const BarButtonItemRef&)) {
    return [weak, action](const BarButtonItemRef& sender) {
      if (const auto self = weak.lock()) (self.get()->*action)(sender);
    };
  };
  bar.setRightBarButtonItem(editMode_ ? BarButtonItem::system(SystemItem::Cancel, calls(&NavController::endEditMode))
                                      : BarButtonItem::withTitle(localized("Select"), BarButtonStyle::Plain,
                                                                 calls(&NavController::beginEditMode)));
  bar.setHidesBackButton(editMode_, false);
  bar.setTitle(editMode_ ? localized("Select Items") : viewTitle_);
}

void NavController::configureToolbar(const DocumentListControllerRef& list) {
  barButtonNewFolder_ = nullptr;
  barButtonDeleteItem_ = nullptr;
  barButtonMoveItem_ = nullptr;
  if (editMode_) {
    makeEditToolbar(list);
    return;
  }
  if (!statusBarOf(*list)) createStatusBarButtonPressDelegate(*list, upgradeOffer_, weakSelf(this));
  displayStatusBar(*list);
  updateStatusUI(list);
}

void NavController::makeEditToolbar(const DocumentListControllerRef& list) {
  barButtonNewFolder_ = editButton(localized("New Folder"), &NavController::promtForNewFolderAndCreate);
  barButtonMoveItem_ = editButton(localized("Move"), &NavController::showMoveTargetForSelectedItems);
  barButtonDeleteItem_ = editButton(localized("Delete"), &NavController::showWarningAndDeleteDocument);
  const BarButtonItemRef space = BarButtonItem::system(SystemItem::FlexibleSpace);
  list->setToolbarItems({barButtonNewFolder_, space, barButtonMoveItem_, space, barButtonDeleteItem_});
}

BarButtonItemRef NavController::editButton(const std::string& title, void (NavController::*action)()) {
  const auto button = std::make_shared<Button>(ButtonType::System);
  button->setTitle(title);
  button->sizeToFit();
  button->addAction(ControlEvent::TouchUpInside, [weak = weakSelf(this), action] {
    if (const auto self = weak.lock()) (self.get()->*action)();
  });
  return BarButtonItem::withCustomView(button);
}

}  // namespace vaelo
