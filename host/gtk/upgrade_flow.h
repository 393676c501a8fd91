// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <functional>
#include <string>

#include "host/gtk/host_dialog.h"
#include "platform/ui/upgrade_flow_manager.h"

namespace vaelo {

/// Shows an offer of the account's provider in a dialog, and leads to the provider's page from there. Main thread.
class UpgradeFlow : public UpgradeFlowManager {
 public:
  using OpenPage = std::function<void(const std::string& address)>;

  UpgradeFlow(StorageOfferRef offer, OpenPage openPage) : offer_(std::move(offer)), openPage_(std::move(openPage)) {}
  StorageOfferRef offer() const override { return offer_; }
  /// Does nothing for an offer that is none of a provider's.
  void beginFlowWithPresentingViewController(const ViewControllerRef& presenter) override;

 private:
  StorageOfferRef offer_;
  OpenPage openPage_;
};

}  // namespace vaelo
