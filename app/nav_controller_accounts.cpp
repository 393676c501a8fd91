// SPDX-License-Identifier: GPL-3.0-or-later
// The account that the drive belongs to, and the offers that come with it.
#include "app/nav_controller.h"
#include "items/vlo_log.h"
#include "platform/archive.h"
#include "platform/platform.h"

namespace vaelo {

namespace {
constexpr const char* TokenKey = "com.marrow.VaeloDriveApp.UbiquityIdentityToken";
}

bool NavController::checkVaeloState() const {
  return Platform::current().cloudDocuments.ubiquityIdentityToken().has_value();
}

void NavController::didBecomeActiveNotification(const Notification& notification) {
  VLO_INFO("Got %@ (nav)", notification.name);
  handleAccountChanges();
}

void NavController::vaeloAccountAvailabilityChanged() {
  VLO_INFO("Vaelo account availability changed");
  handleAccountChanges();
}

void NavController::handleAccountChanges() {
  Platform& platform = Platform::current();
  const std::optional<UbiquityIdentityToken> current = platform.cloudDocuments.ubiquityIdentityToken();
  const std::optional<Data> data = platform.preferences.dataForKey(TokenKey);
  const std::optional<UbiquityIdentityToken> saved = data ? unarchiveToken(*data) : std::nullopt;
  if (current == saved) {
    VLO_DEBUG("Vaelo Token Matches");
    return;
  }
  VLO_INFO("Vaelo Token Changed, enabled=%{public}@, reinitializing view", current ? "YES" : "NO");
  saveVaeloToken(current);
  setupInitialViewController();
}

void NavController::saveVaeloToken(const std::optional<UbiquityIdentityToken>& token) {
  Preferences& preferences = Platform::current().preferences;
  if (token) {
    preferences.setDataForKey(TokenKey, archiveToken(*token));
  } else {
    preferences.removeKey(TokenKey);
  }
}

std::string NavController::offerLevel() const {
  return upgradeOffer_ ? std::to_string(upgradeOffer_->level()) : "not set";
}

void NavController::offerChangedNotification() {
  upgradeOffer_ = Platform::current().offers.currentOffer();
  VLO_INFO("Quota Offer Changed, offer level is %{public}@", offerLevel());
  updateStatusUI(nullptr);
  // An offer usually changes because of a purchase; the free space follows shortly after.
  for (const int seconds : {1, 5, 20}) {
    Platform::current().queues.main().after(std::chrono::seconds(seconds), [self = sharedSelf(this)] {
      if (self->quotaFetcher_) self->quotaFetcher_->fetchNow();
    });
  }
}

}  // namespace vaelo
