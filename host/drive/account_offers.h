// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <functional>
#include <memory>
#include <optional>

#include "host/drive/account_record.h"
#include "host/drive/storage_figures.h"
#include "platform/notifications.h"
#include "platform/queues.h"
#include "platform/storage_quota.h"

namespace vaelo {

/// An offer of the account's provider. Main thread.
class ProviderOffer : public StorageOffer {
 public:
  ProviderOffer(int level, UpgradeTerms terms, const StorageFigures& figures)
      : level_(level), terms_(std::move(terms)), figures_(figures) {}
  /// How many of the provider's thresholds the free space is below; 1 or more.
  int level() const override { return level_; }
  const UpgradeTerms& terms() const { return terms_; }
  /// As measured last.
  const StorageFigures& figures() const { return figures_; }
  void setFigures(const StorageFigures& figures) { figures_ = figures; }

 private:
  const int level_;
  const UpgradeTerms terms_;
  StorageFigures figures_;
};

/// Makes the account's offer from its provider's terms and from what each quota fetch measures. Without terms there is no
/// offer, ever. An offer is another one when its level or its terms are, and when nothing is left, which its button says.
///
/// A change makes the application fetch the quota again, so measures that waver around a threshold would feed themselves:
/// what was measured changes the offer at most once in ChangePause, and what comes meanwhile waits for its end.
///
/// Main thread, but for storageMeasured.
class AccountOffers : public OfferManager {
 public:
  static constexpr std::chrono::seconds FreshFor{300};
  static constexpr std::chrono::seconds ChangePause{60};
  /// What it needs of the account.
  struct Account {
    std::function<std::optional<UpgradeTerms>()> terms;
    /// Begins to measure; storageMeasured is called then, or nothing when it fails.
    std::function<void()> measure;
  };

  AccountOffers(Account account, Queues& queues, NotificationCenter& notifications);
  ~AccountOffers() override;
  bool fetchOfferIfNeeded() override;
  StorageOfferRef currentOffer() override { return offer_; }

  /// Any thread; takes effect on the main queue.
  void storageMeasured(const StorageFigures& figures);
  /// What the account may use, or its provider's terms, may have changed; `isAnother`: so has the account. Measures anew.
  void accountChanged(bool isAnother);

 private:
  void take(const StorageFigures& figures);
  void update();
  void updateAfterPause();
  std::shared_ptr<ProviderOffer> offerNow() const;

  Account account_;
  Queues& queues_;
  NotificationCenter& notifications_;
  std::optional<StorageFigures> figures_;
  Date measuredAt_;
  std::shared_ptr<ProviderOffer> offer_;
  std::optional<Date> changedAt_;  // by a measure
  bool waits_ = false;
  std::shared_ptr<AccountOffers*> self_;  // for blocks that may outlive this
};

}  // namespace vaelo
