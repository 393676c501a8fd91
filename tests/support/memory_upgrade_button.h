// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <utility>

#include "platform/ui/upgrade_button.h"

namespace vaelo {

/// A link that counts what was asked of it.
struct MemoryUpgradeLink : UpgradeLink {
  int code = ActionRunUpgradeFlow;
  bool performs = false;
  int performed = 0;

  int action() const override { return code; }
  bool performDefaultAction() override {
    ++performed;
    return performs;
  }
};

/// A button whose link and looks a test chooses.
class MemoryUpgradeButton : public UpgradeButton {
 public:
  MemoryUpgradeButton(StorageOfferRef offer, bool hidesOffers) : offer_(std::move(offer)), hidesOffers_(hidesOffers) {}

  std::shared_ptr<MemoryUpgradeLink> target = std::make_shared<MemoryUpgradeLink>();
  bool takesNoRoom = false;
  int offersSet = 0;

  StorageOfferRef offer() const override { return offer_; }
  void setOffer(StorageOfferRef offer) override {
    ++offersSet;
    offer_ = std::move(offer);
  }
  std::shared_ptr<UpgradeLink> link() const override { return offer_ ? target : nullptr; }
  bool shouldShowForOffer(const StorageOffer&) const override { return !hidesOffers_; }
  Size intrinsicContentSize() const override { return takesNoRoom ? Size{} : Button::intrinsicContentSize(); }

 private:
  StorageOfferRef offer_;
  bool hidesOffers_;
};

}  // namespace vaelo
