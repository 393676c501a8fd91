// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include "platform/storage_quota.h"

namespace vaelo {

struct MemoryOffer : StorageOffer {
  explicit MemoryOffer(int offerLevel) : level_(offerLevel) {}
  int level() const override { return level_; }

 private:
  int level_;
};

/// The offer that a test makes.
class MemoryOffers : public OfferManager {
 public:
  StorageOfferRef offer;
  bool isBeingFetched = false;  ///< after a request

  bool fetchOfferIfNeeded() override { return isBeingFetched; }
  StorageOfferRef currentOffer() override { return offer; }
};

}  // namespace vaelo
