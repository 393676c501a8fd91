// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <utility>

#include "platform/ui/upgrade_flow_manager.h"

namespace vaelo {

/// A storage upgrade that begins and remembers on which screen.
class MemoryUpgradeFlow : public UpgradeFlowManager {
 public:
  MemoryUpgradeFlow(StorageOfferRef offer, ViewControllerRef& presenter) : offer_(std::move(offer)), presenter_(presenter) {}
  StorageOfferRef offer() const override { return offer_; }
  void beginFlowWithPresentingViewController(const ViewControllerRef& presenter) override { presenter_ = presenter; }

 private:
  StorageOfferRef offer_;
  ViewControllerRef& presenter_;
};

}  // namespace vaelo
