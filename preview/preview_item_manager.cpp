// SPDX-License-Identifier: GPL-3.0-or-later
#include "preview/preview_item_manager.h"

#include "items/vlo_log.h"
#include "platform/platform.h"
#include "platform/ui/screen_factory.h"
#include "platform/ui/search_controller.h"
#include "preview/glimpse_item_controller.h"
#include "preview/preview_details_view_controller.h"

namespace vaelo {

PreviewItemManager::PreviewItemManager() = default;

std::shared_ptr<PreviewItemManager> PreviewItemManager::newItemManagerWithModeNavController(
    long mode, const std::shared_ptr<NavigationController>& navigation) {
  const std::shared_ptr<PreviewItemManager> manager(new PreviewItemManager());
  manager->observeActivity();
  manager->fcQueue_ = Platform::current().queues.makeOperationQueue("fcQueue", QualityOfService::Default);
  manager->downloadQueue_ = Platform::current().queues.makeSerialQueue("downloadQueue");
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
  storeItem(item);
}

void PreviewItemManager::storeItem(const std::shared_ptr<DRItem>& item) {
  const std::lock_guard lock(itemMutex_);
  item_ = item;
}

ViewControllerRef PreviewItemManager::prepareToPreviewItem(const std::shared_ptr<DRItem>& item) {
  if (itemURL() != (item ? item->url() : std::nullopt)) unregisterAsFilePresenter();
  storeItem(item);
  if (!item || (!item->isSymlink() && !item->resolvedURL())) {
    VLO_WARNING("no preview URL, nothing to show");
    return nullptr;
  }
  modifiedDate_ = item->contentModificationDate();
  registerAsFilePresenter();
  const bool exists = item->resolvedURL() && Platform::current().fileManager.fileExistsAtPath(item->resolvedURL()->path());
  detailsViewController_ = nullptr;
  ViewControllerRef screen;
  if (mode_ == 0) {
    screen = createGlimpseController();
  } else {
    screen = createDetailsViewController();
  }
  VLO_DEBUG("Preview: Using %{public}@, %{public}@", screen->className(), exists ? "File Exists" : "File doesn't exist");
  return screen;
}

std::shared_ptr<GlimpseItemController> PreviewItemManager::currentGlimpseController() {
  return GlimpseItemController::defaultController();
}

std::shared_ptr<PreviewDetailsViewController> PreviewItemManager::createDetailsViewController() {
  detailsViewController_ = std::make_shared<PreviewDetailsViewController>();
  detailsViewController_->setMode(mode_);
  detailsViewController_->setItemManager(shared_from_this());
  return detailsViewController_;
}

std::shared_ptr<GlimpseItemController> PreviewItemManager::createGlimpseController() {
  std::shared_ptr<GlimpseItemController> screen = GlimpseItemController::defaultController();
  // The shared screen still has the title of the document before.
  screen->setTitle(item_ ? item_->localizedName().value_or("") : "");
  screen->glimpseNewItem(shared_from_this());
  return screen;
}

bool PreviewItemManager::isPreviewControllerDisplayed(const ViewControllerRef& screen) const {
  return std::dynamic_pointer_cast<PreviewBaseViewController>(screen) ||
         std::dynamic_pointer_cast<GlimpseItemController>(screen);
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

void PreviewItemManager::viewControllerWillDisappear(const ViewControllerRef& screen) {
  if (screen == detailsViewController_) detailsViewController_ = nullptr;
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
