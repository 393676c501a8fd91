// SPDX-License-Identifier: GPL-3.0-or-later
#include "app/nav_controller.h"
#include "items/vlo_log.h"
#include "platform/archive.h"
#include "platform/platform.h"
#include "platform/ui/screen_factory.h"

namespace vaelo {

namespace {

constexpr const char* TokenKey = "com.marrow.VaeloDriveApp.UbiquityIdentityToken";

}  // namespace

bool NavController::checkVaeloState() const {
  return Platform::current().cloudDocuments.ubiquityIdentityToken().has_value();
}

void NavController::didBecomeActiveNotification(const Notification& notification) {
  VLO_INFO("Got %{public}@ (nav)", notification.name);
  handleAccountChanges();
}

void NavController::vaeloAccountAvailabilityChanged() {
  VLO_INFO("Vaelo account availability changed");
  handleAccountChanges();
}

void NavController::handleAccountChanges() {
  const std::optional<UbiquityIdentityToken> current = Platform::current().cloudDocuments.ubiquityIdentityToken();
  const std::optional<Data> archived = Platform::current().preferences.dataForKey(TokenKey);
  const std::optional<UbiquityIdentityToken> saved = archived ? unarchiveToken(*archived) : std::nullopt;
  if (current == saved) {
    VLO_DEBUG("Vaelo Token Matches");
    return;
  }
  VLO_INFO("Vaelo Token Changed, enabled=%{public}@, reinitializing view", current ? "YES" : "NO");
  saveVaeloToken(current);
  setupInitialViewController();
}

void NavController::saveVaeloToken(const std::optional<UbiquityIdentityToken>& token) {
  if (token) {
    Platform::current().preferences.setDataForKey(TokenKey, archiveToken(*token));
  } else {
    Platform::current().preferences.removeKey(TokenKey);
  }
}

std::string NavController::offerLevelText() const {
  return upgradeOffer_ ? std::to_string(upgradeOffer_->level()) : "not set";
}

void NavController::offerChangedNotification() {
  upgradeOffer_ = Platform::current().offers.currentOffer();
  VLO_INFO("Quota Offer Changed, offer level is %{public}@", offerLevelText());
  updateStatusUI(nullptr);
  for (const ViewControllerRef& screen : viewControllers()) {
    const auto list = std::dynamic_pointer_cast<DocumentListController>(screen);
    const StatusBarRef bar = list ? statusBarOf(*list) : nullptr;
    if (bar) bar->showUpgradeOffer(upgradeOffer_);
  }
  // An offer usually changes with a purchase, and the free space soon after it.
  for (const int seconds : {1, 5, 20}) {
    Platform::current().queues.main().after(std::chrono::seconds(seconds), [self = sharedSelf(this)] {
      if (self->quotaFetcher_) self->quotaFetcher_->fetchNow();
    });
  }
}

void NavController::upgradeStorageButtonPressed() {
  upgradeFlowMgr_ = Platform::current().screens.makeUpgradeFlow(upgradeOffer_);
  if (!upgradeOffer_) {
    VLO_INFO("UpgradeStorage: No upgrade offer");
    return;
  }
  VLO_INFO("UpgradeStorage: presenting view controller");
  upgradeFlowMgr_->beginFlowWithPresentingViewController(topViewController());
}

}  // namespace vaelo
