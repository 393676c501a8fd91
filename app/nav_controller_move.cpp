// SPDX-License-Identifier: GPL-3.0-or-later
#include "app/nav_controller.h"
#include "fileops/menu_enable_checks.h"
#include "fileops/new_folder_prompt.h"
#include "fileops/rename_prompt.h"
#include "fileops/ui_utils.h"
#include "items/dr_item.h"
#include "items/file_utils.h"
#include "items/url_additions.h"
#include "items/vlo_log.h"
#include "platform/localized.h"
#include "platform/platform.h"

namespace vaelo {

namespace {

std::string counted(const char* key, std::size_t count) {
  return Platform::current().formatting.localizedCount(key, static_cast<std::int64_t>(count));
}

}  // namespace

void NavController::showRenamePrompt(const URL& url) {
  const std::shared_ptr<DRItem> item = DRItem::initWithURL(url);
  if (!item) return;
  if (vlo_isDesktopOrDocumentsFolder(url)) {
    VLO_WARNING("Not renaming special folder: %@", url);
    UIUtils::showUnsupportedError(visibleViewController());
    return;
  }
  const auto rename = [url](const std::string& name, bool& accepted) -> std::string {
    if (name.empty()) return "";
    VLO_USER_ACTION("Rename entry confirmed (nav)");
    const std::optional<Error> error = UIUtils::renameItemAtURLToName(url, name);
    accepted = !error;
    return UIUtils::bestMessage(error);
  };
  folderPromptAlert_ = RenamePrompt::newWithFilenameCompletion(item->localizedName(), rename);
  visibleViewController()->presentViewController(folderPromptAlert_->alert(), true);
}

void NavController::promtForNewFolderAndCreate() {
  VLO_USER_ACTION("Pressed NewFolder");
  VLO_INFO("Pressed NewFolder");
  const DocumentListControllerRef list = getTopDocumentListController();
  if (list) showNewFolderPromptDuringMoveItemsToMove(list->presentedURL(), {});
}

void NavController::showMoveTargetForSelectedItems() {
  VLO_USER_ACTION("Pressed Move");
  VLO_INFO("Pressed Move");
  const DocumentListControllerRef list = getTopDocumentListController();
  if (!list) return;
  // Leaving edit mode clears the selection.
  const std::vector<URL> items = list->selectedItems();
  setEditModeAndUpdateUIForViewController(false, list);
  showMoveTargetForItemsInFolder(items, list->presentedURL());
}

void NavController::showMoveTargetForItemsInFolder(const std::vector<URL>& items, const std::optional<URL>& folder) {
  if (MenuEnableChecks::isDesktopOrDocumentsInURLArray(items)) {
    VLO_WARNING("Not moving items with special folder: %@", items);
    UIUtils::showUnsupportedError(visibleViewController());
    return;
  }
  VLO_INFO("Prompting for Move Target, %d items", items.size());
  const bool crossContainer = vlo_canCrossZoneMoveURLs(items);
  const bool hasFolders = !folder || MenuEnableChecks::containerHasSubfolders(*folder);
  if (!crossContainer && !hasFolders) {
    showNewFolderPromptDuringMoveItemsToMove(folder, items);
    return;
  }
  const auto picker = std::make_shared<DocumentTargetSelectionController>(items, crossContainer);
  picker->setDelegate(weakSelf(this));
  picker->setModalPresentationStyle(PresentationStyle::OverCurrentContext);
  visibleViewController()->presentViewController(picker, true, [] { VLO_DEBUG("Presented moveTarget"); });
}

void NavController::documentTargetSelectionControllerDidSelectItemAtURL(
    const std::shared_ptr<DocumentTargetSelectionController>& picker, const URL& folder) {
  VLO_USER_ACTION("Move Target Selected (nav)");
  VLO_INFO("Move Target Selected: %@", folder);
  picker->dismissViewControllerAnimated(true);
  moveItemsToDirectoryAndShowErrorsToDirectory(picker->itemsToMove(), folder);
}

std::vector<Error> NavController::moveItemsToDirectoryToDirectory(const std::vector<URL>& items, const URL& folder) {
  VLO_DEBUG("MoveTarget = %@", folder);
  VLO_DEBUG("ItemsToMove = %@", items);
  std::vector<Error> errors;
  for (const URL& item : items) {
    std::optional<Error> error = FileUtils::moveTo(item, folder.appendingPathComponent(item.lastPathComponent(), false));
    if (error) errors.push_back(std::move(*error));
  }
  return errors;
}

void NavController::moveItemsToDirectoryAndShowErrorsToDirectory(const std::vector<URL>& items, const URL& folder) {
  const std::vector<Error> errors = moveItemsToDirectoryToDirectory(items, folder);
  if (errors.size() == 1) {
    UIUtils::showFriendlyMoveErrorParentViewController(errors.front(), topViewController());
  } else if (!errors.empty()) {
    UIUtils::showAlertMessageParentViewController(counted(".DICT.CANNOT_MOVE_ITEMS.%d", errors.size()), "",
                                                  topViewController());
  }
}

void NavController::showNewFolderPromptDuringMoveItemsToMove(const std::optional<URL>& folder,
                                                             const std::vector<URL>& items) {
  VLO_USER_ACTION("Show New Folder Prompt (nav, during move)");
  if (!folder) {
    VLO_WARNING("dlc.presentedURL is nil");
    return;
  }
  const bool moves = !items.empty();
  const std::string title = moves ? counted(".DICT.MOVE_ITEMS.%d", items.size()) : localized("New Folder");
  const auto entered = [weak = weakSelf(this), folder = *folder, items](const std::string& name, bool& accepted) {
    return newFolderEntered(weak, folder, items, name, accepted);
  };
  folderPromptAlert_ =
      NewFolderPrompt::newWithTitleDoneButtonTextCompletion(title, moves ? localized("Move") : localized("Create"), entered);
  presentViewController(folderPromptAlert_->alert(), true);
}

// Where a move fails the folder has been made and stays, and so does the prompt, with what went wrong.
std::string NavController::newFolderEntered(const std::weak_ptr<NavController>& navigation, const URL& folder,
                                            const std::vector<URL>& items, const std::string& name, bool& accepted) {
  if (name.empty()) return "";
  VLO_USER_ACTION("New Folder name entry Confirmed");
  VLO_INFO("New folder entered: %@", name);
  const URL newURL = folder.appendingPathComponent(name, true);
  if (FileUtils::exists(newURL)) {
    VLO_INFO("Item exists at path: %@", newURL);
    return UIUtils::bestMessage(Error{FileErrorDomain, FileErrorCode::WriteFileExists, {}, {}, {}});
  }
  if (const std::optional<Error> error = FileUtils::mkdir(newURL)) return UIUtils::bestMessage(error);
  const std::shared_ptr<NavController> self = navigation.lock();
  const std::vector<Error> errors =
      items.empty() || !self ? std::vector<Error>() : self->moveItemsToDirectoryToDirectory(items, newURL);
  accepted = errors.empty();
  if (errors.empty()) return "";
  return errors.size() == 1 ? UIUtils::bestMessage(errors.front()) : counted(".DICT.CANNOT_MOVE_ITEMS.%d", errors.size());
}

}  // namespace vaelo
