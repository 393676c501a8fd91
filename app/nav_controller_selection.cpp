// SPDX-License-Identifier: GPL-3.0-or-later
// What happens to an item that the user chose in a list.
#include "app/nav_controller.h"
#include "app/settings.h"
#include "fileops/ui_utils.h"
#include "items/launch_utils.h"
#include "items/vlo_log.h"
#include "platform/platform.h"
#include "platform/ui/screen_factory.h"
#include "platform/ui/search_controller.h"
#include "preview/glimpse_item_controller.h"
#include "preview/preview_item_manager.h"

namespace vaelo {

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

std::shared_ptr<DRItem> NavController::targetOfLink(const DRItem& link) const {
  CloudDocuments& cloud = Platform::current().cloudDocuments;
  if (!link.resolvedURL() || !cloud.URLIsInDriveMirror(*link.resolvedURL())) {
    VLO_DEBUG("DLC Selection is symlink to outside target: %@", link.resolvedURL());
    return nullptr;
  }
  const std::shared_ptr<DRItem> target = DRItem::initWithURL(link.resolvedURL());
  if (!target) {
    VLO_DEBUG("DLC Selection is symlink that didn't resolve to valid target: %@", link.resolvedURL());
    return nullptr;
  }
  if (!target->resolvedURL() || !cloud.URLIsInDriveMirror(*target->resolvedURL())) {
    VLO_DEBUG("DLC Selection is symlink to invalid target: %@", target->resolvedURL());
    return nullptr;
  }
  return target;
}

void NavController::documentListControllerDidSelectItemAtURL(const DocumentListControllerRef&, const URL& url) {
  VLO_USER_ACTION("Selected Item (dlc)");
  VLO_INFO("Picked URL: %@", url);
  std::shared_ptr<DRItem> item = DRItem::initWithURL(url);
  VLO_DEBUG("DRItem: %@ (%{public}@ bytes %{public}@)", item, item ? item->fileSize() : std::nullopt, url.pathExtension());
  DispatchQueue& mainQueue = Platform::current().queues.main();
  if (!item) {
    Error missing{FileErrorDomain, FileErrorCode::ReadNoSuchFile, {}, {}, {}};
    missing.localizedDescription =
        Platform::current().formatting.localizedString("The file doesn’t exist any more. It may have been moved or deleted.");
    UIUtils::showErrorParentViewController(missing, topViewController());
    mainQueue.async([self = sharedSelf(this)] { self->setupInitialViewController(); });
    return;
  }
  if (editMode_) {
    VLO_DEBUG("DLC Selection not allowed while in edit mode");
    return;
  }
  if (!Settings::quickLaunch()) {
    mainQueue.async([self = sharedSelf(this), item] { self->showPreviewPreviewMode(item, 0); });
    return;
  }
  if (item->isSymlink()) {
    item = targetOfLink(*item);
    if (!item) return;
  }
  if (item->isDirectory()) {
    VLO_DEBUG("Building DLC stack for symlink to %@", item->url());
    switchToFolderOf(*item);
    return;
  }
  if (LaunchUtils::openInDefaultAppViewControllerRequireOpenIn(*item->url(), topViewController(), true)) {
    VLO_DEBUG("openInDefaultApp returned YES, app launched");
    return;
  }
  VLO_DEBUG("openInDefaultApp returned NO, showing preview");
  mainQueue.async([weak = weakSelf(this), item] {
    if (const auto self = weak.lock()) self->showPreviewPreviewMode(item, item->canPreview() ? 0 : 1);
  });
}

void NavController::documentListControllerURLWasRemoved(const DocumentListControllerRef&) {
  popViewControllerAnimated(true);
}

ViewControllerRef NavController::documentListControllerViewControllerForPreviewingItemAtURL(
    const DocumentListControllerRef&, const URL& url) {
  VLO_USER_ACTION("DLC Action Firmpress Peek");
  VLO_DEBUG("DLC asking for PeekVC for %@", url);
  const Result<ResourceMap> values = Platform::current().resourceValues.promisedItemResourceValues(
      url, {ResourceKey::IsPackage, ResourceKey::IsRegularFile, ResourceKey::IsDirectory});
  const auto is = [&](ResourceKey key) {
    return values.value && values.value->contains(key) && values.value->at(key).boolValue();
  };
  if (is(ResourceKey::IsPackage) || is(ResourceKey::IsRegularFile)) {
    const std::shared_ptr<DRItem> item = DRItem::initWithURL(url);
    // The manager before is not told here: its document stays watched until the peek is committed or left.
    itemManager_ = PreviewItemManager::newItemManagerWithModeNavController(0, sharedSelf<NavigationController>(this));
    return itemManager_->prepareToPreviewItem(item);
  }
  if (is(ResourceKey::IsDirectory)) return Platform::current().screens.makePeekFolderViewController(url);
  VLO_DEBUG("URL is not a regular file, package, or folder");
  return nullptr;
}

void NavController::orbPopToURL(const URL& url) {
  const bool searching = std::dynamic_pointer_cast<SearchController>(presentedViewController()) != nullptr;
  if (searching) dismissViewControllerAnimated(true);
  const std::shared_ptr<DRItem> item = DRItem::initWithURL(url);
  if (item && item->isDirectory()) {
    VLO_DEBUG("Building DLC stack for Firmpress of %@", item->url());
    switchToFolderOf(*item);
    return;
  }
  if (item && LaunchUtils::openInDefaultAppViewControllerRequireOpenIn(*item->url(), topViewController(), true)) {
    VLO_DEBUG("openInDefaultApp returned YES, app launched");
    return;
  }
  VLO_DEBUG("openInDefaultApp returned NO, showing cached Glimpse from Orb");
  const std::shared_ptr<GlimpseItemController> glimpse = itemManager_ ? itemManager_->currentGlimpseController() : nullptr;
  if (searching) warpToFolderForURL(url);
  if (glimpse) pushViewController(glimpse, true);
}

void NavController::documentListControllerPerformActionURLOriginatingViewCompletion(const DocumentListControllerRef&,
                                                                                    int action, const URL& url,
                                                                                    const ViewRef&,
                                                                                    Completion completion) {
  if (action == ItemAction::FirmpressPop) {
    VLO_USER_ACTION("DLC Action Firmpress Pop");
    VLO_INFO("Preview action: %@", url);
    if (completion) completion();
    orbPopToURL(url);
    return;
  }
  VLO_ERROR("performAction:%{public}@ -- unexpected value", action);
  if (completion) completion();
}

void NavController::documentListControllerPerformActionURL(const DocumentListControllerRef& list, int action,
                                                           const URL& url) {
  documentListControllerPerformActionURLOriginatingViewCompletion(list, action, url, view(), [] {});
}

}  // namespace vaelo
