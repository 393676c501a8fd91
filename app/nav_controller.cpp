// SPDX-License-Identifier: GPL-3.0-or-later
#include "app/nav_controller.h"

#include "fileops/ui_utils.h"
#include "items/dr_item.h"
#include "items/file_utils.h"
#include "items/vlo_log.h"
#include "platform/localized.h"
#include "platform/platform.h"
#include "platform/ui/screen_factory.h"
#include "preview/preview_item_manager.h"

namespace vaelo {

namespace {

constexpr double QuotaInterval = 300;  // seconds

}  // namespace

void NavController::viewDidLoad() {
  setDelegate(weakSelf(this));
  observeNotifications();
  setupInitialViewController();
  NavigationController::viewDidLoad();
  observations_.push_back(
      Platform::current().notifications.addObserver(OfferChangedNotification, [weak = weakSelf(this)](const Notification&) {
        if (const auto self = weak.lock()) self->offerChangedNotification();
      }));
  OfferManager& offers = Platform::current().offers;
  if (!offers.fetchOfferIfNeeded()) upgradeOffer_ = offers.currentOffer();
  VLO_INFO("Quota Offer level is %{public}@", offerLevelText());
}

void NavController::observeNotifications() {
  NotificationCenter& center = Platform::current().notifications;
  observations_.push_back(
      center.addObserver(DidBecomeActiveNotification, [weak = weakSelf(this)](const Notification& notification) {
        if (const auto self = weak.lock()) self->didBecomeActiveNotification(notification);
      }));
  observations_.push_back(center.addObserver(IdentityDidChangeNotification, [weak = weakSelf(this)](const Notification&) {
    if (const auto self = weak.lock()) self->vaeloAccountAvailabilityChanged();
  }));
}

void NavController::viewWillDisappear(bool animated) { NavigationController::viewWillDisappear(animated); }

void NavController::setupInitialViewController() {
  pickerIsAlive_ = false;
  if (checkVaeloState()) {
    VLO_DEBUG("Vaelo is enabled");
    setToolbarHidden(false);
    const DocumentListControllerRef root = Platform::current().screens.makeRootList();
    VLO_DEBUG("Contained items: %@", root ? std::optional(root->containedItems().all()) : std::nullopt);
    if (root) {
      initNewListController(root);
      setViewControllers({root}, false);
    } else {
      VLO_ERROR("DocumentListController creation failed");
    }
    quotaFetcher_ = QuotaFetcher::init();
    quotaFetcher_->setDelegate(weakSelf(this));
    quotaFetcher_->runWithInterval(QuotaInterval);
  } else {
    VLO_WARNING("Vaelo is not enabled");
    showDriveUnavailable();
    setToolbarHidden(true);
    quotaFetcher_ = nullptr;
    quotaBytes_ = 0;
  }
  VLO_DEBUG("%{public}@ viewDidLoad", className());
}

void NavController::showDriveUnavailable() {
  if (const ViewControllerRef screen = Platform::current().screens.makeDriveUnavailable()) {
    setViewControllers({screen}, false);
    return;
  }
  VLO_ERROR("DriveUnavailableController creation failed");
  Platform::current().queues.main().async([self = sharedSelf(this)] {
    UIUtils::showAlertMessageParentViewController("", localized("Vaelo is not enabled"), self);
  });
}

void NavController::initNewListController(const DocumentListControllerRef& list) {
  viewTitle_ = list->title();
  VLO_DEBUG("New DLC (%d items): \"%@\", UTI=%@, URL=%@", list->containedItems().size(), list->title(),
            FileUtils::getResourceValueForURL(ResourceKey::TypeIdentifier, list->presentedURL()), list->presentedURL());
  // A list may have 100,000 items; their lines are made only for a log that takes them.
  if (Platform::current().log.wantsDebug()) {
    for (const URL& item : list->containedItems().all()) {
      VLO_DEBUG("    %@", "..." + item.path().substr(item.path().rfind('/')));
    }
  }
  unsigned actions = 1u << ItemAction::Delete | 1u << ItemAction::Rename;
  actions |= 1u << ItemAction::Share;
  actions |= 1u << ItemAction::Info | 1u << ItemAction::Move;
  actions |= 1u << ItemAction::FirmpressPop;
  list->setAvailableActions(actions);
  configureNavBar(list);
  if (list->title().empty()) VLO_WARNING("Warning: newList title not set");
  list->view()->setBackgroundColor(Color::white());
  configureToolbar(list);
  list->setDelegate(weakSelf(this));
}

void NavController::navigationControllerWillShowViewControllerAnimated(NavigationController&, const ViewControllerRef&,
                                                                       bool) {}

void NavController::navigationControllerDidShowViewControllerAnimated(NavigationController&, const ViewControllerRef& shown,
                                                                      bool) {
  const auto list = std::dynamic_pointer_cast<DocumentListController>(shown);
  if (!list) return;
  if (itemManager_) itemManager_->unregisterAsFilePresenter();
  itemManager_ = nullptr;
  if (editMode_) editMode_ = list->editing();
  updateStatusUI(list);
  initNewListController(list);
  setToolbarHidden(false);
}

void NavController::encodeRestorableStateWithCoder(RestorationCoder& coder) {
  NavigationController::encodeRestorableStateWithCoder(coder);
  if (!itemManager_ || !itemManager_->item() || !itemManager_->item()->url()) return;
  coder.encode("url", *itemManager_->item()->url());
  coder.encode("PreviewMode", static_cast<std::int64_t>(itemManager_->mode()));
}

void NavController::decodeRestorableStateWithCoder(const RestorationCoder& coder) {
  NavigationController::decodeRestorableStateWithCoder(coder);
  const Value value = coder.decode("url");
  const URL* url = value.get<URL>();
  const std::shared_ptr<DRItem> item = url ? DRItem::initWithURL(*url) : nullptr;
  if (!item || item->isDirectory()) return;
  replaceItemManager(static_cast<long>(coder.decode("PreviewMode").signedValue()))->previewItem(item);
}

}  // namespace vaelo
