// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <atomic>
#include <cstdint>
#include <functional>
#include <memory>
#include <optional>
#include <vector>

#include "platform/error.h"
#include "platform/notifications.h"
#include "platform/queues.h"

namespace vaelo {

class QuotaFetcher;

/// Hears of each new value. Main thread.
class QuotaFetcherDelegate {
 public:
  virtual ~QuotaFetcherDelegate() = default;
  virtual void quotaFetcherDidUpdateValue(QuotaFetcher& fetcher, std::uint64_t freeBytes) = 0;
};

/// Asks now and then how many bytes are free in the account, while the application is in front. Dropping it stops the
/// asking. Main thread, but for performFetch and fetchUserQuotaWithCompletion, which run on the fetcher's own queue.
class QuotaFetcher : public std::enable_shared_from_this<QuotaFetcher> {
 public:
  using Completion = std::function<void(std::int64_t freeBytes, const std::optional<Error>& error)>;

  static std::shared_ptr<QuotaFetcher> init();
  std::shared_ptr<QuotaFetcherDelegate> delegate() const { return delegate_.lock(); }
  void setDelegate(std::weak_ptr<QuotaFetcherDelegate> delegate) { delegate_ = std::move(delegate); }
  /// The last value that arrived; 0 before the first.
  std::uint64_t freeBytes() const { return freeBytes_; }
  /// False while the application is in the background.
  bool canFetch() const { return canFetch_; }

  /// Fetches now and then every `seconds`, instead of what ran before.
  void runWithInterval(double seconds);
  /// Fetches once more, soon.
  void fetchNow();
  void performFetch();
  /// Without an account the completion is not called; else it comes once, on any thread.
  void fetchUserQuotaWithCompletion(Completion completion);
  void notify(std::uint64_t freeBytes);

 private:
  QuotaFetcher();
  void observeActivity();
  void didBecomeActiveNotification(const Notification& notification);
  void willResignActiveNotification(const Notification& notification);

  std::weak_ptr<QuotaFetcherDelegate> delegate_;
  std::uint64_t freeBytes_ = 0;
  std::atomic<bool> canFetch_ = true;  // written on the main thread, read on queue_
  std::shared_ptr<OperationQueue> quotaFetchingOperationsQueue_;
  std::shared_ptr<DispatchQueue> queue_;
  std::unique_ptr<TimerSource> timer_;
  std::vector<NotificationCenter::Token> observations_;
};

}  // namespace vaelo
