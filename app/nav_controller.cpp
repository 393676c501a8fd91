// SPDX-License-Identifier: GPL-3.0-or-later
// Set-up, stack, warps, search and restoration of the navigation controller.
#include "app/nav_controller.h"

#include "fileops/ui_utils.h"
#include "items/file_utils.h"
#include "items/url_additions.h"
#include "items/vlo_log.h"
#include "platform/platform.h"
#include "platform/ui/screen_factory.h"
#include "preview/preview_item_manager.h"

namespace vaelo {

namespace {

/// All but More, which is no longer offered.
constexpr unsigned OfferedActions = 125;

std::vector<ViewControllerRef> asStack(const std::vector<DocumentListControllerRef>& lists) {
  return {lists.begin(), lists.end()};
}

}  // namespace

NavController::~NavController() = default;

void NavController::viewDidLoad() {
  setDelegate(weakSelf(this));
  observe();
  setupInitialViewController();
  NavigationController::viewDidLoad();
  Platform& platform = Platform::current();
  const auto weak = weakSelf(this);
  observations_.push_back(platform.notifications.addObserver(OfferChangedNotification, [weak](const Notification&) {
    if (const auto self = weak.lock()) self->offerChangedNotification();
  }));
  if (!platform.offers.fetchOfferIfNeeded()) upgradeOffer_ = platform.offers.currentOffer();
  VLO_INFO("Quota Offer level is %{public}@", offerLevel());
}

void NavController::observe() {
  NotificationCenter& center = Platform::current().notifications;
  const auto weak = weakSelf(this);
  observations_.push_back(center.addObserver(DidBecomeActiveNotification, [weak](const Notification& notification) {
    if (const auto self = weak.lock()) self->didBecomeActiveNotification(notification);
  }));
  observations_.push_back(center.addObserver(IdentityDidChangeNotification, [weak](const Notification&) {
    if (const auto self = weak.lock()) self->vaeloAccountAvailabilityChanged();
  }));
}

void NavController::viewWillDisappear(bool animated) { NavigationController::viewWillDisappear(animated); }

void NavController::setupInitialViewController() {
  pickerIsAlive_ = false;
  if (checkVaeloState()) {
    showDrive();
  } else {
    showDriveUnavailable();
  }
  VLO_DEBUG("%{public}@ viewDidLoad", className());
}

void NavController::showDrive() {
  VLO_DEBUG("Vaelo is enabled");
  setToolbarHidden(false);
  const DocumentListControllerRef root = Platform::current().screens.makeRootList();
  VLO_DEBUG("Contained items: %@", root ? root->containedItems() : std::vector<URL>());
  if (root) {
    initNewListController(root);
    setViewControllers({root}, false);
  } else {
    VLO_ERROR("DocumentListController creation failed");
  }
  constexpr double interval = 300;
  quotaFetcher_ = QuotaFetcher::make();
  quotaFetcher_->setDelegate(weakSelf(this));
  quotaFetcher_->runWithInterval(interval);
}

void NavController::showDriveUnavailable() {
  VLO_WARNING("Vaelo is not enabled");
  if (const ViewControllerRef screen = Platform::current().screens.makeDriveUnavailable()) {
    setViewControllers({screen}, false);
  } else {
    VLO_ERROR("DriveUnavailableController creation failed");
    Platform::current().queues.main().async([self = sharedSelf(this)] {
      const std::string message = Platform::current().formatting.localizedString("Vaelo is not enabled");
      UIUtils::showAlertMessageParentViewController("", message, self);
    });
  }
  setToolbarHidden(true);
  quotaFetcher_.reset();
  quotaBytes_ = 0;
}

void NavController::initNewListController(const DocumentListControllerRef& list) {
  viewTitle_ = list->title();
  const std::optional<URL> folder = list->presentedURL();
  VLO_DEBUG("New DLC (%d items): \"%@\", UTI=%@, URL=%@", list->containedItems().size(), viewTitle_,
            FileUtils::getResourceValueForURL(ResourceKey::TypeIdentifier, folder), folder);
  if (Platform::current().log.wantsDebug()) {
    for (const URL& item : list->containedItems()) {
      const std::string path = item.path();
      const bool below = folder && item.isInside(*folder);
      VLO_DEBUG("    %@", below ? "..." + path.substr(folder->path().size()) : path);
    }
  }
  list->setAvailableActions(OfferedActions);
  configureNavBar(list);
  if (list->title().empty()) VLO_WARNING("Warning: newList title not set");
  list->view()->setBackgroundColor(Color::white());
  configureToolbar(list);
  list->setDelegate(weakSelf(this));
}

DocumentListControllerRef NavController::getTopDocumentListController() const {
  const ViewControllerRef top = topViewController();
  if (!top) VLO_WARNING("ERROR: topViewController is nil");
  return std::dynamic_pointer_cast<DocumentListController>(top);
}

void NavController::navigationControllerDidShowViewControllerAnimated(NavigationController&,
                                                                      const ViewControllerRef& screen, bool) {
  const auto list = std::dynamic_pointer_cast<DocumentListController>(screen);
  if (!list) return;
  if (itemManager_) itemManager_->unregisterAsFilePresenter();
  itemManager_.reset();
  if (editMode_) editMode_ = list->editing();
  updateStatusUI(list);
  initNewListController(list);
  setToolbarHidden(false);
}

bool NavController::warpToFolderForURL(const URL& url) {
  const auto lists = PreviewItemManager::dlcStackForURL(url);
  if (!lists) return false;
  setViewControllers(asStack(*lists), false);
  return true;
}

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
  newItemManager(mode);
  if (itemManager_->warpToNewURL(resolved)) return true;
  VLO_WARNING("warpToNewURL failed: %@", resolved);
  return false;
}

void NavController::newItemManager(long mode) {
  if (itemManager_) itemManager_->unregisterAsFilePresenter();
  itemManager_ = PreviewItemManager::newItemManagerWithModeNavController(mode, sharedSelf<NavigationController>(this));
}

void NavController::showPreviewPreviewMode(const std::shared_ptr<DRItem>& item, long mode) {
  if (!item) return;
  newItemManager(mode);
  itemManager_->previewItem(item);
}

void NavController::switchToFolderOf(const DRItem& item) {
  const auto lists = item.url() ? PreviewItemManager::dlcStackForURL(*item.url()) : std::nullopt;
  if (lists) {
    setViewControllers(asStack(*lists), true);
  } else {
    VLO_ERROR("Couldn't build DLC stack for %@. Not switching to folder", item.url());
  }
}

void NavController::startSearch(const std::string& query) {
  dismissViewControllerAnimated(false);
  popToRootViewControllerAnimated(false);
  constexpr std::chrono::milliseconds untilListStands(700);
  Platform::current().queues.main().after(untilListStands, [self = sharedSelf(this), query] {
    if (const auto list = self->getTopDocumentListController()) {
      list->startSearchWithQueryStringBecomeFirstResponder(query, true);
    }
  });
}

void NavController::logContainerURL() const {
  if (const auto url = Platform::current().cloudDocuments.defaultContainerURL()) {
    VLO_DEBUG("Vaelo container is at %{public}@", *url);
  } else {
    VLO_DEBUG("Vaelo is not available");
  }
}

void NavController::encodeRestorableStateWithCoder(RestorationCoder& coder) {
  NavigationController::encodeRestorableStateWithCoder(coder);
  if (!itemManager_ || !itemManager_->item() || !itemManager_->item()->url()) return;
  coder.encode("url", *itemManager_->item()->url());
  coder.encode("PreviewMode", static_cast<std::int64_t>(itemManager_->mode()));
}

void NavController::decodeRestorableStateWithCoder(const RestorationCoder& coder) {
  NavigationController::decodeRestorableStateWithCoder(coder);
  const Value held = coder.decode("url");
  const URL* url = held.get<URL>();
  if (!url) return;
  const std::shared_ptr<DRItem> item = DRItem::initWithURL(*url);
  if (!item || item->isDirectory()) return;
  newItemManager(static_cast<long>(coder.decode("PreviewMode").signedValue()));
  itemManager_->previewItem(item);
}

}  // namespace vaelo
