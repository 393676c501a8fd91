// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <memory>

namespace vaelo {

/// An offer to enlarge the account's storage; compared by identity.
class StorageOffer {
 public:
  virtual ~StorageOffer() = default;
  virtual int level() const = 0;
};

using StorageOfferRef = std::shared_ptr<StorageOffer>;

/// Keeps the current offer; OfferChangedNotification is posted on the main queue when it changes. Main thread.
class OfferManager {
 public:
  virtual ~OfferManager() = default;
  /// Starts a fetch unless a fresh answer is there; true when one was started.
  virtual bool fetchOfferIfNeeded() = 0;
  virtual StorageOfferRef currentOffer() = 0;
};

}  // namespace vaelo
