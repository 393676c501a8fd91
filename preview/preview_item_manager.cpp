// SPDX-License-Identifier: GPL-3.0-or-later
#include "preview/preview_item_manager.h"

#include "items/vlo_log.h"
#include "platform/platform.h"
#include "platform/ui/screen_factory.h"
#include "platform/ui/search_controller.h"
#include "preview/glimpse_item_controller.h"

namespace vaelo {

namespace {

std::string pathOf(const std::optional<URL>& url) { return url ? url->path() : std::string(); }

}  // namespace

PreviewItemManager::PreviewItemManager() = default;

std::shared_ptr<PreviewItemManager> PreviewItemManager::newItemManagerWithModeNavController(
    long mode, const std::shared_ptr<NavigationController>& navigation) {
  const std::shared_ptr<PreviewItemManager> manager(new PreviewItemManager());
  manager->observeActivity();
  manager->fcQueue_ = Platform::current().queues.makeOperationQueue("fcQueue", QualityOfService::Default);
  GlimpseItemController::defaultController();
  manager->navigationController_ = navigation;
  manager->mode_ = mode;
  return manager;
}

PreviewItemManager::~PreviewItemManager() { unregisterAsFilePresenter(); }

void PreviewItemManager::observeActivity() {
  NotificationCenter& center = Platform::current().notifications;
  const std::weak_ptr<PreviewItemManager> weakSelf = weak_from_this();
  observations_.push_back(center.addObserver(DidBecomeActiveNotification, [weakSelf](const Notification&) {
    if (const auto self = weakSelf.lock()) self->didBecomeActiveNotification();
  }));
  observations_.push_back(center.addObserver(WillResignActiveNotification, [weakSelf](const Notification&) {
    if (const auto self = weakSelf.lock()) self->willResignActiveNotification();
  }));
}

void PreviewItemManager::didBecomeActiveNotification() {
  VLO_DEBUG("Becoming active for %@", itemURL());
  registerAsFilePresenter();
}

void PreviewItemManager::willResignActiveNotification() {
  VLO_DEBUG("Resigning active for %@", itemURL());
  unregisterAsFilePresenter();
}

std::optional<URL> PreviewItemManager::itemURL() {
  const std::lock_guard lock(itemMutex_);
  return item_ ? item_->url() : std::nullopt;
}

void PreviewItemManager::setItemUpdatePreview(const std::shared_ptr<DRItem>& item, bool update) {
  VLO_DEBUG("Previewing %@", item ? item->url() : std::nullopt);
  if (item && update) {
    if (const ViewControllerRef screen = prepareToPreviewItem(item)) replaceLastViewController(screen);
    return;
  }
  const std::lock_guard lock(itemMutex_);
  item_ = item;
}

ViewControllerRef PreviewItemManager::prepareToPreviewItem(const std::shared_ptr<DRItem>& item) {
  if (itemURL() != (item ? item->url() : std::nullopt)) unregisterAsFilePresenter();
  {
    const std::lock_guard lock(itemMutex_);
    item_ = item;
  }
  if (!item || (!item->isSymlink() && !item->resolvedURL())) {
    VLO_WARNING("no preview URL, nothing to show");
    return nullptr;
  }
  modifiedDate_ = item->contentModificationDate();
  registerAsFilePresenter();
  const bool exists = item->resolvedURL() && Platform::current().fileManager.fileExistsAtPath(item->resolvedURL()->path());
  const std::shared_ptr<GlimpseItemController> screen = createGlimpseController();
  VLO_DEBUG("Preview: Using %{public}@, %{public}@", screen->className(), exists ? "File Exists" : "File doesn't exist");
  return screen;
}

std::shared_ptr<GlimpseItemController> PreviewItemManager::currentGlimpseController() {
  return GlimpseItemController::defaultController();
}

std::shared_ptr<GlimpseItemController> PreviewItemManager::createGlimpseController() {
  std::shared_ptr<GlimpseItemController> screen = GlimpseItemController::defaultController();
  screen->setTitle(item_ ? item_->localizedName().value_or("") : "");
  screen->glimpseNewItem(shared_from_this());
  return screen;
}

bool PreviewItemManager::isPreviewControllerDisplayed(const ViewControllerRef& screen) const {
  return std::dynamic_pointer_cast<GlimpseItemController>(screen) != nullptr;
}

void PreviewItemManager::replaceLastViewController(const ViewControllerRef& screen) {
  const std::shared_ptr<NavigationController> navigation = navigationController_.lock();
  if (!navigation) return;
  std::vector<ViewControllerRef> stack = navigation->viewControllers();
  if (!stack.empty() && isPreviewControllerDisplayed(stack.back())) {
    stack.back() = screen;
    navigation->setViewControllers(stack, false);
  } else if (std::dynamic_pointer_cast<SearchController>(navigation->presentedViewController())) {
    const std::weak_ptr<NavigationController> weakNavigation = navigation;
    navigation->dismissViewControllerAnimated(true, [weakNavigation, screen] {
      if (const auto alive = weakNavigation.lock()) alive->pushViewController(screen, true);
    });
  } else {
    navigation->pushViewController(screen, true);
  }
}

void PreviewItemManager::viewControllerWillDisappear(const ViewControllerRef&) {}

void PreviewItemManager::registerAsFilePresenter() {
  const std::lock_guard lock(lock_);
  if (filePresenterRegistered_) return;
  Platform::current().fileCoordination.addFilePresenter(*this);
  filePresenterRegistered_ = true;
}

void PreviewItemManager::unregisterAsFilePresenter() {
  const std::lock_guard lock(lock_);
  if (!filePresenterRegistered_) return;
  Platform::current().fileCoordination.removeFilePresenter(*this);
  filePresenterRegistered_ = false;
}

std::optional<URL> PreviewItemManager::presentedItemURL() {
  const std::optional<URL> url = itemURL();
  VLO_DEBUG("presentedItemURL %@", url);
  return url;
}

void PreviewItemManager::presentedItemDidChange() {
  VLO_INFO("presentedItemDidChange: %@", itemURL());
  {
    const std::lock_guard lock(lock_);
    if (refreshPending_) return;
    refreshPending_ = true;
  }
  const std::weak_ptr<PreviewItemManager> weakSelf = weak_from_this();
  Platform::current().queues.main().after(std::chrono::seconds(1), [weakSelf] {
    const auto self = weakSelf.lock();
    if (!self) return;
    if (const auto url = self->itemURL()) self->refreshItem(*url);
    self->refreshPending_ = false;
  });
}

void PreviewItemManager::refreshItem(const URL& url) {
  const std::shared_ptr<DRItem> fresh = DRItem::initWithURL(url);
  if (!fresh) return;
  const std::string oldPath = pathOf(itemURL());
  const std::string newPath = pathOf(fresh->url());
  const bool pathChanged = oldPath != newPath;
  if (pathChanged) {
    VLO_ERROR("UNEXPECTED: path changed but we only got a presentedItemDidChange: %@ to %@", oldPath, newPath);
  }
  const std::optional<Date> date = fresh->contentModificationDate();
  VLO_DEBUG("%@: modDate %{public}@ vs %{public}@", fresh->url(), modifiedDate_, date);
  const bool later = modifiedDate_ && date && *modifiedDate_ < *date;
  modifiedDate_ = date;
  setItemUpdatePreview(fresh, pathChanged);
  VLO_INFO("Refreshing %@", itemURL());
  const std::shared_ptr<GlimpseItemController>& glimpse = GlimpseItemController::defaultController();
  glimpse->setTitle(fresh->localizedName().value_or(""));
  if (later && glimpse->isVisible()) {
    VLO_DEBUG("GLPreviewController: refreshCurrentPreviewItem");
    glimpse->refreshCurrentPreviewItem();
  }
}

void PreviewItemManager::presentedItemDidMoveToURL(const URL& url) {
  CloudDocuments& cloud = Platform::current().cloudDocuments;
  const URL real = cloud.realPathURL(url);
  VLO_INFO("presentedItemDidMoveToURL: %@ changed to %@", itemURL(), real);
  if (cloud.URLIsInDriveTrash(real) || !cloud.URLIsInDriveMirror(real)) {
    accommodatePresentedItemDeletionWithCompletionHandler([](std::optional<Error>) {});
    return;
  }
  if (pathOf(itemURL()) == real.path()) {
    VLO_WARNING("UNEXPECTED: duplicate calls to presentedItemDidMoveToURL: %@", real.path());
    return;
  }
  const std::weak_ptr<PreviewItemManager> weakSelf = weak_from_this();
  Platform::current().queues.main().async([weakSelf, real] {
    const auto self = weakSelf.lock();
    if (!self) return;
    if (pathOf(self->itemURL()) == real.path()) {
      VLO_WARNING("UNEXPECTED: duplicate calls to presentedItemDidMoveToURL: %@", real.path());
    } else {
      self->setItem(DRItem::initWithURL(real));
    }
  });
}

void PreviewItemManager::accommodatePresentedItemDeletionWithCompletionHandler(Completion completion) {
  VLO_INFO("Accommodate deletion: %@", itemURL());
  completion(std::nullopt);
  unregisterAsFilePresenter();
  const std::shared_ptr<PreviewItemManager> self = weak_from_this().lock();
  if (!self) return;
  Platform::current().queues.main().async([self] {
    if (const auto navigation = self->navigationController_.lock()) navigation->popViewControllerAnimated(true);
  });
}

void PreviewItemManager::accommodatePresentedSubitemDeletionAtURL(const URL& url, Completion completion) {
  VLO_INFO("%@ accommodate subitem deletion at %@", itemURL(), url);
  completion(std::nullopt);
  unregisterAsFilePresenter();
  const std::weak_ptr<PreviewItemManager> weakSelf = weak_from_this();
  Platform::current().queues.main().after(std::chrono::seconds(1), [weakSelf] {
    const auto self = weakSelf.lock();
    if (!self) return;
    VLO_INFO("Refreshing %@", self->itemURL());
    const std::shared_ptr<GlimpseItemController>& glimpse = GlimpseItemController::defaultController();
    if (glimpse->isVisible()) glimpse->refreshCurrentPreviewItem();
    self->refreshPending_ = false;
  });
}

bool PreviewItemManager::warpToNewURL(const URL& url) {
  const std::optional<std::vector<DocumentListControllerRef>> lists = dlcStackForURL(url);
  if (!lists) return false;
  std::vector<ViewControllerRef> stack(lists->begin(), lists->end());
  VLO_DEBUG("New VC stack of DLCs: %@", stack);
  unregisterAsFilePresenter();
  const std::shared_ptr<DRItem> item = DRItem::initWithURL(url);
  if (item && !item->isDirectory()) {
    // A document without a place on the disk has no screen; its folder is then as near as one can get.
    if (const ViewControllerRef screen = prepareToPreviewItem(item)) stack.push_back(screen);
  }
  if (const auto navigation = navigationController_.lock()) {
    navigation->dismissViewControllerAnimated(false);
    navigation->setViewControllers(stack, true);
  }
  setItemUpdatePreview(item, false);
  return true;
}

std::optional<std::vector<DocumentListControllerRef>> PreviewItemManager::dlcStackForURL(const URL& url) {
  URL folder = url;
  std::shared_ptr<DRItem> item = DRItem::initWithURL(folder);
  if (item && !item->isDirectory()) {
    folder = folder.deletingLastPathComponent();
    item = DRItem::initWithURL(folder);
  }
  if (item && item->isDirectory()) {
    auto lists = Platform::current().screens.hierarchyTo(folder);
    if (!lists) VLO_ERROR(": Couldn't build DLC stack for %@.", folder);
    return lists;
  }
  VLO_ERROR("Can't build DLC stack, can't get directory: %@", folder);
  return std::nullopt;
}

}  // namespace vaelo
