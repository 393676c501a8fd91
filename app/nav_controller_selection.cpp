// SPDX-License-Identifier: GPL-3.0-or-later
#include "app/nav_controller.h"
#include "app/peek_folder_view_controller.h"
#include "app/settings.h"
#include "fileops/ui_utils.h"
#include "items/dr_item.h"
#include "items/launch_utils.h"
#include "items/vlo_log.h"
#include "platform/platform.h"
#include "platform/ui/search_controller.h"
#include "preview/glimpse_item_controller.h"
#include "preview/preview_item_manager.h"

namespace vaelo {

namespace {

Error noSuchFile(const URL& url) {
  Error error;
  error.domain = FileErrorDomain;
  error.code = FileErrorCode::ReadNoSuchFile;
  error.userInfo[FilePathErrorKey] = url.path();
  error.localizedDescription =
      Platform::current().formatting.localizedString("The file couldn’t be opened because there is no such file.");
  return error;
}

bool isInMirror(const std::optional<URL>& url) { return url && Platform::current().cloudDocuments.URLIsInDriveMirror(*url); }

}  // namespace

void NavController::documentListControllerDidSelectItemAtURL(const DocumentListControllerRef&, const URL& url) {
  VLO_USER_ACTION("Selected Item (dlc)");
  VLO_INFO("Picked URL: %@", url);
  std::shared_ptr<DRItem> item = DRItem::initWithURL(url);
  VLO_DEBUG("DRItem: %@ (%{public}@ bytes %{public}@)", item, item ? item->fileSize() : std::nullopt, url.pathExtension());
  if (!item) {
    UIUtils::showErrorParentViewController(noSuchFile(url), topViewController());
    chosenItemIsGone();
    return;
  }
  if (editMode_) {
    VLO_DEBUG("DLC Selection not allowed while in edit mode");
    return;
  }
  if (!Settings::quickLaunch()) {
    showPreviewSoon(item, 0);
    return;
  }
  if (item->isSymlink()) item = targetOfLink(*item);
  if (!item) return;
  if (item->isDirectory()) {
    VLO_DEBUG("Building DLC stack for symlink to %@", item->url());
    if (!replaceStackDownToFolder(*item->url(), true)) {
      VLO_ERROR("Couldn't build DLC stack for %@. Not switching to folder", item->url());
    }
    return;
  }
  if (openInDefaultApp(item)) {
    VLO_DEBUG("openInDefaultApp returned YES, app launched");
    return;
  }
  VLO_DEBUG("openInDefaultApp returned NO, showing preview");
  showPreviewSoon(item, item->canPreview() ? 0 : 1);
}

void NavController::chosenItemIsGone() {
  Platform::current().queues.main().async([self = sharedSelf(this)] { self->setupInitialViewController(); });
}

void NavController::showPreviewSoon(const std::shared_ptr<DRItem>& item, long mode) {
  Platform::current().queues.main().async([weak = weakSelf(this), item, mode] {
    if (const auto self = weak.lock()) self->showPreviewPreviewMode(item, mode);
  });
}

std::shared_ptr<DRItem> NavController::targetOfLink(const DRItem& link) const {
  if (!isInMirror(link.resolvedURL())) {
    VLO_DEBUG("DLC Selection is symlink to outside target: %@", link.resolvedURL());
    return nullptr;
  }
  const std::shared_ptr<DRItem> target = DRItem::initWithURL(link.resolvedURL());
  if (!target) {
    VLO_DEBUG("DLC Selection is symlink that didn't resolve to valid target: %@", link.resolvedURL());
    return nullptr;
  }
  // A link in a circle leads to itself.
  if (target->isSymlink() && target->resolvedURL() == target->url()) {
    VLO_DEBUG("DLC Selection is symlink that didn't resolve to valid target: %@", link.resolvedURL());
    return nullptr;
  }
  if (!isInMirror(target->resolvedURL())) {
    VLO_DEBUG("DLC Selection is symlink to invalid target: %@", target->resolvedURL());
    return nullptr;
  }
  return target;
}

bool NavController::openInDefaultApp(const std::shared_ptr<DRItem>& item) {
  return item && item->url() &&
         LaunchUtils::openInDefaultAppViewControllerRequireOpenIn(*item->url(), topViewController(), true);
}

void NavController::showPreviewPreviewMode(const std::shared_ptr<DRItem>& item, long mode) {
  if (!item) return;
  // Held here, since showing the preview may end in a list, for which the manager is dropped.
  const std::shared_ptr<PreviewItemManager> manager = replaceItemManager(mode);
  manager->previewItem(item);
}

ViewControllerRef NavController::documentListControllerViewControllerForPreviewingItemAtURL(const DocumentListControllerRef&,
                                                                                            const URL& url) {
  VLO_USER_ACTION("DLC Action Firmpress Peek");
  VLO_DEBUG("DLC asking for PeekVC for %@", url);
  Result<ResourceMap> read = Platform::current().resourceValues.promisedItemResourceValues(
      url, {ResourceKey::IsPackage, ResourceKey::IsRegularFile, ResourceKey::IsDirectory});
  ResourceMap values = std::move(read.value).value_or(ResourceMap());
  const auto flag = [&values](ResourceKey key) { return values[key].boolValue(); };
  if (flag(ResourceKey::IsPackage) || flag(ResourceKey::IsRegularFile)) {
    // Not by replaceItemManager: a peek does not tell the present manager to stop following its document.
    const std::shared_ptr<DRItem> item = DRItem::initWithURL(url);
    itemManager_ = PreviewItemManager::newItemManagerWithModeNavController(0, sharedSelf(this));
    return itemManager_->prepareToPreviewItem(item);
  }
  if (flag(ResourceKey::IsDirectory)) return std::make_shared<PeekFolderViewController>(url);
  VLO_DEBUG("URL is not a regular file, package, or folder");
  return nullptr;
}

void NavController::orbPopToURL(const URL& url) {
  const bool searching = std::dynamic_pointer_cast<SearchController>(presentedViewController()) != nullptr;
  if (searching) dismissViewControllerAnimated(true);
  const std::shared_ptr<DRItem> item = DRItem::initWithURL(url);
  if (item && item->isDirectory()) {
    VLO_DEBUG("Building DLC stack for Firmpress of %@", item->url());
    if (!replaceStackDownToFolder(*item->url(), true)) {
      VLO_ERROR("Couldn't build DLC stack for %@. Not switching to folder", item->url());
    }
    return;
  }
  if (openInDefaultApp(item)) {
    VLO_DEBUG("openInDefaultApp returned YES, app launched");
    // What the peek prepared is not shown now. It must not follow the document, whose deletion would take the list away.
    if (itemManager_ && getTopDocumentListController()) {
      itemManager_->unregisterAsFilePresenter();
      itemManager_ = nullptr;
    }
    return;
  }
  VLO_DEBUG("openInDefaultApp returned NO, showing cached Glimpse from Orb");
  const std::shared_ptr<PreviewItemManager> peeked = itemManager_;
  if (searching) warpToFolderForURL(url);
  if (!peeked) return;
  pushViewController(peeked->currentGlimpseController(), true);
  if (itemManager_ == peeked) return;
  // The list that the warp showed dropped it, but the preview is nothing without it.
  itemManager_ = peeked;
  itemManager_->registerAsFilePresenter();
}

}  // namespace vaelo
