// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/gtk/offer_button.h"

#include "host/drive/account_offers.h"
#include "host/support/texts.h"

namespace vaelo {

namespace {

constexpr int ActionOpenPage = 1;

class ProviderLink : public UpgradeLink {
 public:
  ProviderLink(UpgradeTerms terms, OfferButton::OpenPage openPage)
      : terms_(std::move(terms)), openPage_(std::move(openPage)) {}
  int action() const override { return terms_.asksFirst ? ActionRunUpgradeFlow : ActionOpenPage; }
  bool performDefaultAction() override {
    if (terms_.asksFirst) return false;
    openPage_(terms_.page);
    return true;
  }

 private:
  UpgradeTerms terms_;
  OfferButton::OpenPage openPage_;
};

}  // namespace

OfferButton::OfferButton(StorageOfferRef offer, OpenPage openPage) : openPage_(std::move(openPage)) {
  titleLabel()->setFont(Font::preferred(TextStyle::Caption1));
  setOffer(std::move(offer));
}

void OfferButton::setOffer(StorageOfferRef offer) {
  offer_ = std::move(offer);
  const auto* provider = dynamic_cast<const ProviderOffer*>(offer_.get());
  setTitle(provider && provider->figures().free == 0 ? _("Storage Full – Upgrade…") : _("Storage Almost Full – Upgrade…"));
}

std::shared_ptr<UpgradeLink> OfferButton::link() const {
  const auto* provider = dynamic_cast<const ProviderOffer*>(offer_.get());
  return provider ? std::make_shared<ProviderLink>(provider->terms(), openPage_) : nullptr;
}

bool OfferButton::shouldShowForOffer(const StorageOffer& offer) const {
  return dynamic_cast<const ProviderOffer*>(&offer) != nullptr;
}

}  // namespace vaelo
