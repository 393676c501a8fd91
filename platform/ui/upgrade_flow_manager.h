// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include "platform/storage_quota.h"
#include "platform/ui/view_controller.h"

namespace vaelo {

/// Walks the user through a storage upgrade. It must be kept alive while the flow runs. Main thread.
class UpgradeFlowManager {
 public:
  virtual ~UpgradeFlowManager() = default;
  /// Null: no offer.
  virtual StorageOfferRef offer() const = 0;
  virtual void beginFlowWithPresentingViewController(const ViewControllerRef& presenter) = 0;
};

}  // namespace vaelo
