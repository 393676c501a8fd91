// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/drive/account_offers.h"

#include <algorithm>

namespace vaelo {

AccountOffers::AccountOffers(Account account, Queues& queues, NotificationCenter& notifications)
    : account_(std::move(account)),
      queues_(queues),
      notifications_(notifications),
      self_(std::make_shared<AccountOffers*>(this)) {}

AccountOffers::~AccountOffers() { *self_ = nullptr; }

bool AccountOffers::fetchOfferIfNeeded() {
  if (!account_.terms()) return false;
  if (figures_ && queues_.now() - measuredAt_ < FreshFor) return false;
  account_.measure();
  return true;
}

void AccountOffers::storageMeasured(const StorageFigures& figures) {
  queues_.main().async([self = self_, figures] {
    if (*self) (*self)->take(figures);
  });
}

void AccountOffers::take(const StorageFigures& figures) {
  figures_ = figures;
  measuredAt_ = queues_.now();
  updateAfterPause();
}

void AccountOffers::accountChanged(bool isAnother) {
  if (isAnother) figures_.reset();
  // Somebody did something, such as to buy: what comes of it need not wait.
  changedAt_.reset();
  update();
  if (account_.terms()) account_.measure();
}

std::shared_ptr<ProviderOffer> AccountOffers::offerNow() const {
  const std::optional<UpgradeTerms> terms = account_.terms();
  if (!terms || !figures_) return nullptr;
  const auto passed = std::count_if(terms->below.begin(), terms->below.end(),
                                    [share = figures_->freePercent()](double threshold) { return share < threshold; });
  if (passed == 0) return nullptr;
  const auto isFull = [](const StorageFigures& figures) { return figures.free == 0; };
  if (offer_ && offer_->level() == passed && offer_->terms() == *terms && isFull(offer_->figures()) == isFull(*figures_)) {
    offer_->setFigures(*figures_);
    return offer_;
  }
  return std::make_shared<ProviderOffer>(static_cast<int>(passed), *terms, *figures_);
}

void AccountOffers::update() {
  std::shared_ptr<ProviderOffer> now = offerNow();
  if (now == offer_) return;
  offer_ = std::move(now);
  notifications_.post({OfferChangedNotification, {}});
}

void AccountOffers::updateAfterPause() {
  if (offerNow() == offer_) return;
  const Date now = queues_.now();
  const Date due = changedAt_ ? *changedAt_ + ChangePause : now;
  if (due <= now) {
    changedAt_ = now;
    update();
    return;
  }
  if (waits_) return;
  waits_ = true;
  queues_.main().after(due - now, [self = self_] {
    if (!*self) return;
    (*self)->waits_ = false;
    (*self)->updateAfterPause();
  });
}

}  // namespace vaelo
