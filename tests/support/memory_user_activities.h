// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <atomic>
#include <memory>
#include <mutex>
#include <string>
#include <utility>
#include <vector>

#include "platform/user_activity.h"

namespace vaelo {

/// An activity that remembers what was said of it.
class MemoryUserActivity : public UserActivity {
 public:
  explicit MemoryUserActivity(std::string type) : type_(std::move(type)) {}
  std::string activityType() const override { return type_; }
  Dictionary userInfo() const override {
    const std::lock_guard lock(mutex_);
    return userInfo_;
  }
  void setUserInfo(Dictionary userInfo) override {
    const std::lock_guard lock(mutex_);
    userInfo_ = std::move(userInfo);
  }
  void setEligibleForBaton(bool eligible) override { eligible_ = eligible; }
  void becomeCurrent() override { current_ = true; }
  void resignCurrent() override { current_ = false; }
  bool isEligible() const { return eligible_; }
  bool isCurrent() const { return current_; }

 private:
  std::string type_;
  mutable std::mutex mutex_;
  Dictionary userInfo_;  // guarded by mutex_
  std::atomic<bool> eligible_ = false;
  std::atomic<bool> current_ = false;
};

class MemoryUserActivities : public UserActivities {
 public:
  std::shared_ptr<UserActivity> makeActivity(const std::string& type) override {
    made.push_back(std::make_shared<MemoryUserActivity>(type));
    return made.back();
  }
  std::vector<std::shared_ptr<MemoryUserActivity>> made;
};

}  // namespace vaelo
