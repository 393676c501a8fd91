// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include "platform/storage_quota.h"

namespace vaelo {

/// A drive whose provider sells nothing: there is never an offer.
class NoOffers : public OfferManager {
 public:
  bool fetchOfferIfNeeded() override { return false; }
  StorageOfferRef currentOffer() override { return nullptr; }
};

}  // namespace vaelo
