// SPDX-License-Identifier: GPL-3.0-or-later
#include "app/quota_fetcher.h"

#include "items/vlo_log.h"
#include "platform/platform.h"

namespace vaelo {

QuotaFetcher::QuotaFetcher()
    : quotaFetchingOperationsQueue_(Platform::current().queues.makeOperationQueue("com.marrow.VaeloDriveApp.quotafetching",
                                                                                  QualityOfService::Utility)),
      queue_(Platform::current().queues.makeSerialQueue("com.marrow.VaeloDriveApp.quotafetcher")) {}

std::shared_ptr<QuotaFetcher> QuotaFetcher::init() {
  const std::shared_ptr<QuotaFetcher> fetcher(new QuotaFetcher());
  fetcher->observeActivity();
  return fetcher;
}

void QuotaFetcher::observeActivity() {
  NotificationCenter& center = Platform::current().notifications;
  const std::weak_ptr<QuotaFetcher> weakSelf = weak_from_this();
  observations_.push_back(center.addObserver(DidBecomeActiveNotification, [weakSelf](const Notification& notification) {
    if (const auto self = weakSelf.lock()) self->didBecomeActiveNotification(notification);
  }));
  observations_.push_back(center.addObserver(WillResignActiveNotification, [weakSelf](const Notification& notification) {
    if (const auto self = weakSelf.lock()) self->willResignActiveNotification(notification);
  }));
}

void QuotaFetcher::didBecomeActiveNotification(const Notification& notification) {
  VLO_INFO("Got %{public}@ (quota)", notification.name);
  canFetch_ = true;
}

void QuotaFetcher::willResignActiveNotification(const Notification& notification) {
  VLO_INFO("Got %{public}@ (quota)", notification.name);
  canFetch_ = false;
}

void QuotaFetcher::runWithInterval(double seconds) {
  timer_.reset();
  const std::chrono::nanoseconds interval(static_cast<std::int64_t>(seconds * 1e9));
  const std::weak_ptr<QuotaFetcher> weakSelf = weak_from_this();
  timer_ = Platform::current().queues.makeTimer(queue_, interval, std::chrono::seconds(1), [weakSelf] {
    if (const auto self = weakSelf.lock()) self->performFetch();
  });
}

void QuotaFetcher::fetchNow() {
  const std::weak_ptr<QuotaFetcher> weakSelf = weak_from_this();
  queue_->async([weakSelf] {
    if (const auto self = weakSelf.lock()) self->performFetch();
  });
}

void QuotaFetcher::performFetch() {
  if (!canFetch_) {
    VLO_DEBUG("Not fetching quota: backgrounded.");
    return;
  }
  const std::weak_ptr<QuotaFetcher> weakSelf = weak_from_this();
  fetchUserQuotaWithCompletion([weakSelf](std::int64_t freeBytes, const std::optional<Error>& error) {
    if (error) {
      VLO_WARNING("can't update quota: %{public}@", *error);
      return;
    }
    // The completion may run inside an operation of the fetcher's queue, which must not be the last to hold the fetcher.
    Platform::current().queues.main().async([weakSelf, freeBytes] {
      if (const auto self = weakSelf.lock()) self->notify(static_cast<std::uint64_t>(freeBytes));
    });
  });
}

void QuotaFetcher::fetchUserQuotaWithCompletion(Completion completion) {
  if (!Platform::current().cloudDocuments.ubiquityIdentityToken()) {
    VLO_INFO("Not fetching quota. Ubiquity is not enabled");
    return;
  }
  quotaFetchingOperationsQueue_->addOperation([completion = std::move(completion)] {
    Platform::current().cloudDocuments.fetchQuota(
        [completion](const Result<std::int64_t>& result) { completion(result.value.value_or(0), result.error); });
  });
}

void QuotaFetcher::notify(std::uint64_t freeBytes) {
  freeBytes_ = freeBytes;
  if (const auto listener = delegate()) listener->quotaFetcherDidUpdateValue(*this, freeBytes_);
}

}  // namespace vaelo
