// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <cstdint>
#include <functional>
#include <map>
#include <memory>
#include <string>
#include <utility>

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
      if (const auto observer = weak.lock()) observer->changed(keyPath);
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
  /// What the first subscriber returned for the progress's withdrawal; empty without a subscriber.
  Withdrawn publish(const URL& url, std::shared_ptr<Progress> progress) {
    const auto [first, last] = subscriptions_.equal_range(url.path());
    for (auto at = first; at != last; ++at) {
      if (const auto subscription = at->second.lock()) return (*subscription)(std::move(progress));
    }
    return {};
  }

 private:
  std::multimap<std::string, std::weak_ptr<Published>> subscriptions_;
};

}  // namespace vaelo
