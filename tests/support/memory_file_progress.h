// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <cstdint>
#include <functional>
#include <map>
#include <memory>
#include <string>
#include <utility>
#include <vector>

#include "platform/file_progress.h"

namespace vaelo {

/// A transfer whose progress a test chooses.
class MemoryProgress : public Progress {
 public:
  explicit MemoryProgress(std::string kind = FileProgressKind) : kind_(std::move(kind)) {}
  std::string kind() const override { return kind_; }
  std::int64_t completedUnits() const override { return completed_; }
  std::int64_t totalUnits() const override { return total_; }
  std::string description() const override {
    return "progress " + std::to_string(completed_) + "/" + std::to_string(total_);
  }
  std::shared_ptr<void> observe(const std::string& keyPath, std::function<void(const std::string&)> changed) override {
    auto observer = std::make_shared<Observer>(Observer{keyPath, std::move(changed)});
    observers_.emplace(observer.get(), observer);
    return observer;
  }
  void setUnits(std::int64_t completed, std::int64_t total) {
    completed_ = completed;
    total_ = total;
    tell("fractionCompleted");
  }
  void tell(const std::string& keyPath) {
    for (const auto& [_, weak] : std::map(observers_)) {
      if (const auto observer = weak.lock(); observer && observer->keyPath == keyPath) observer->changed(keyPath);
    }
  }
  std::size_t observerCount() const {
    std::size_t count = 0;
    for (const auto& [_, weak] : observers_) count += weak.expired() ? 0 : 1;
    return count;
  }

 private:
  struct Observer {
    std::string keyPath;
    std::function<void(const std::string&)> changed;
  };
  std::string kind_;
  std::int64_t completed_ = 0;
  std::int64_t total_ = 0;
  std::map<Observer*, std::weak_ptr<Observer>> observers_;
};

/// Progress that a test publishes.
class MemoryFileProgress : public FileProgress {
 public:
  std::shared_ptr<void> subscribe(const URL& url, Published published) override {
    auto subscription = std::make_shared<Published>(std::move(published));
    subscriptions_.emplace(url.path(), subscription);
    return subscription;
  }
  std::size_t subscriberCount(const URL& url) const {
    const auto [first, last] = subscriptions_.equal_range(url.path());
    std::size_t count = 0;
    for (auto at = first; at != last; ++at) count += at->second.expired() ? 0 : 1;
    return count;
  }
  /// As when another program has so many bytes of a document: published with the first of them.
  void transfer(const URL& url, std::int64_t completed, std::int64_t total) {
    Transfer& transfer = transfers_[url.path()];
    const bool isNew = !transfer.progress;
    if (isNew) transfer.progress = std::make_shared<MemoryProgress>();
    transfer.progress->setUnits(completed, total);
    if (isNew) publishToAll(url, transfer);
  }
  /// The document is there.
  void finish(const URL& url) {
    const auto found = transfers_.find(url.path());
    if (found == transfers_.end()) return;
    const Transfer transfer = std::move(found->second);
    transfers_.erase(found);
    transfer.progress->setUnits(transfer.progress->totalUnits(), transfer.progress->totalUnits());
    for (const auto& [weak, withdrawn] : transfer.withdrawals) {
      if (!weak.expired() && withdrawn) withdrawn();
    }
  }
  /// What the first subscriber returned for the progress's withdrawal; empty without a subscriber.
  Withdrawn publish(const URL& url, std::shared_ptr<Progress> progress) {
    const auto [first, last] = subscriptions_.equal_range(url.path());
    for (auto at = first; at != last; ++at) {
      if (const auto subscription = at->second.lock()) return (*subscription)(std::move(progress));
    }
    return {};
  }

 private:
  struct Transfer {
    std::shared_ptr<MemoryProgress> progress;
    std::vector<std::pair<std::weak_ptr<Published>, Withdrawn>> withdrawals;
  };
  void publishToAll(const URL& url, Transfer& transfer) {
    const std::multimap<std::string, std::weak_ptr<Published>> all = subscriptions_;
    const auto [first, last] = all.equal_range(url.path());
    for (auto at = first; at != last; ++at) {
      if (const auto told = at->second.lock()) transfer.withdrawals.emplace_back(at->second, (*told)(transfer.progress));
    }
  }

  std::multimap<std::string, std::weak_ptr<Published>> subscriptions_;
  std::map<std::string, Transfer> transfers_;
};

}  // namespace vaelo
