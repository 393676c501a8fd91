// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <functional>
#include <string>

#include "platform/ui/upgrade_button.h"

namespace vaelo {

/// The button for an offer of the account's provider. Main thread.
class OfferButton : public UpgradeButton {
 public:
  /// Opens the provider's page.
  using OpenPage = std::function<void(const std::string& address)>;

  OfferButton(StorageOfferRef offer, OpenPage openPage);
  StorageOfferRef offer() const override { return offer_; }
  void setOffer(StorageOfferRef offer) override;
  /// Opens the page by itself, unless the provider wants the application to show the offer first.
  std::shared_ptr<UpgradeLink> link() const override;
  /// True for the offers of a provider.
  bool shouldShowForOffer(const StorageOffer& offer) const override;

 private:
  StorageOfferRef offer_;
  OpenPage openPage_;
};

}  // namespace vaelo
