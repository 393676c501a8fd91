// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <memory>

#include "platform/storage_quota.h"
#include "platform/ui/button.h"

namespace vaelo {

/// What an upgrade button leads to.
class UpgradeLink {
 public:
  /// The action that the application runs itself.
  static constexpr int ActionRunUpgradeFlow = 3;
  virtual ~UpgradeLink() = default;
  virtual int action() const = 0;
  /// Does what the link can do on its own; false when it can't.
  virtual bool performDefaultAction() = 0;
};

/// A button for a storage offer, with a title that says what it is for. Main thread.
class UpgradeButton : public Button {
 public:
  /// Null: no offer.
  virtual StorageOfferRef offer() const = 0;
  /// Also takes over the title that suits the offer.
  virtual void setOffer(StorageOfferRef offer) = 0;
  /// Null when there is no offer.
  virtual std::shared_ptr<UpgradeLink> link() const = 0;
  /// Whether the offer is one that a button should be shown for.
  virtual bool shouldShowForOffer(const StorageOffer& offer) const = 0;
};

}  // namespace vaelo
