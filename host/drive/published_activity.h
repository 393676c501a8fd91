// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <functional>
#include <memory>
#include <mutex>
#include <optional>
#include <string>

#include "host/drive/activity_file.h"
#include "platform/user_activity.h"

namespace vaelo {

/// Which activity is current, for the activities that want to be. Any thread.
class CurrentActivity {
 public:
  virtual ~CurrentActivity() = default;
  /// The activity becomes current in place of any other, or says something else; nothing stands for one that is not offered.
  virtual void becomes(const void* activity, std::optional<ActivityRecord> offered) = 0;
  virtual void changes(const void* activity, std::optional<ActivityRecord> offered) = 0;
  /// Does nothing when another one is current by now.
  virtual void resigns(const void* activity) = 0;
};

/// An activity of this device, which tells `current` of itself as long as that lives; or of another, which tells nobody.
class PublishedActivity : public UserActivity {
 public:
  PublishedActivity(std::string type, std::weak_ptr<CurrentActivity> current);
  ~PublishedActivity() override;
  std::string activityType() const override { return type_; }
  Dictionary userInfo() const override;
  /// Other devices get what is text in it.
  void setUserInfo(Dictionary userInfo) override;
  void setEligibleForBaton(bool eligible) override;
  void becomeCurrent() override;
  void resignCurrent() override;

 private:
  std::optional<ActivityRecord> offered() const;

  const std::string type_;
  const std::weak_ptr<CurrentActivity> current_;
  mutable std::mutex mutex_;  // guards all below
  Dictionary userInfo_;
  bool eligible_ = false;
};

}  // namespace vaelo
