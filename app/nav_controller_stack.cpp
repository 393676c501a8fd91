// SPDX-License-Identifier: GPL-3.0-or-later
#include "app/nav_controller.h"
#include "items/url_additions.h"
#include "items/vlo_log.h"
#include "platform/platform.h"
#include "platform/ui/search_controller.h"
#include "preview/preview_item_manager.h"

namespace vaelo {

namespace {

/// The root list must be on the screen before its search field can take the focus.
constexpr std::chrono::milliseconds SearchDelay{700};

}  // namespace

DocumentListControllerRef NavController::getTopDocumentListController() {
  const ViewControllerRef top = topViewController();
  if (!top) VLO_WARNING("ERROR: topViewController is nil");
  return std::dynamic_pointer_cast<DocumentListController>(top);
}

bool NavController::replaceStackDownToFolder(const URL& url, bool animated) {
  const auto lists = PreviewItemManager::dlcStackForURL(url);
  if (!lists) return false;
  setViewControllers({lists->begin(), lists->end()}, animated);
  return true;
}

bool NavController::warpToFolderForURL(const URL& url) { return replaceStackDownToFolder(url, false); }

bool NavController::warpToNewURLPreviewMode(const std::optional<URL>& url, long mode) {
  dismissViewControllerAnimated(false);
  if (!url) return false;
  CloudDocuments& cloud = Platform::current().cloudDocuments;
  if (!cloud.URLIsInDriveMirror(*url)) {
    VLO_DEBUG("Preview URL is not in the Mobile Documents dir: %@", *url);
    return false;
  }
  if (cloud.URLIsInDriveTrash(*url)) {
    VLO_DEBUG("Preview URL is in Trash: %@", *url);
    return false;
  }
  const URL resolved = vlo_URLByResolvingPromise(*url);
  // Held here, since the manager is dropped as soon as its warp shows a list.
  const std::shared_ptr<PreviewItemManager> manager = replaceItemManager(mode);
  const bool warped = manager->warpToNewURL(resolved);
  if (!warped) VLO_WARNING("warpToNewURL failed: %@", resolved);
  return warped;
}

std::shared_ptr<PreviewItemManager> NavController::replaceItemManager(long mode) {
  if (itemManager_) itemManager_->unregisterAsFilePresenter();
  itemManager_ = PreviewItemManager::newItemManagerWithModeNavController(mode, sharedSelf(this));
  return itemManager_;
}

void NavController::startSearch(const std::string& query) {
  dismissViewControllerAnimated(false);
  popToRootViewControllerAnimated(false);
  Platform::current().queues.main().after(SearchDelay, [weak = weakSelf(this), query] {
    const auto self = weak.lock();
    const DocumentListControllerRef list = self ? self->getTopDocumentListController() : nullptr;
    if (list) list->startSearchWithQueryStringBecomeFirstResponder(query, true);
  });
}

void NavController::documentListControllerDidSelectContainerWithViewController(const DocumentListControllerRef&,
                                                                               const DocumentListControllerRef& chosen) {
  VLO_USER_ACTION("Selected Folder (dlc)");
  if (!chosen || !chosen->presentedURL()) {
    VLO_WARNING("New DLC is nil");
    return;
  }
  const URL folder = *chosen->presentedURL();
  VLO_INFO("User selected folder %@", folder);
  if (editMode_) {
    VLO_WARNING("DLC Navigation not allowed while in edit mode");
    return;
  }
  if (std::dynamic_pointer_cast<SearchController>(presentedViewController())) {
    dismissViewControllerAnimated(true);
    if (warpToFolderForURL(folder)) return;
  }
  initNewListController(chosen);
  pushViewController(chosen, true);
}

void NavController::documentListControllerURLWasRemoved(const DocumentListControllerRef&) {
  popViewControllerAnimated(true);
}

void NavController::logContainerURL() {
  if (const std::optional<URL> url = Platform::current().cloudDocuments.defaultContainerURL()) {
    VLO_DEBUG("Vaelo container is at %{public}@", *url);
  } else {
    VLO_DEBUG("Vaelo is not available");
  }
}

}  // namespace vaelo
