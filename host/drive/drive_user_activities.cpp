// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/drive/drive_user_activities.h"

namespace vaelo {

namespace {

class DriveUserActivity : public UserActivity {
 public:
  explicit DriveUserActivity(std::string type) : type_(std::move(type)) {}
  std::string activityType() const override { return type_; }
  Dictionary userInfo() const override { return userInfo_; }
  void setUserInfo(Dictionary userInfo) override { userInfo_ = std::move(userInfo); }
  void setEligibleForBaton(bool eligible) override { eligible_ = eligible; }
  void becomeCurrent() override { current_ = eligible_; }
  void resignCurrent() override { current_ = false; }

 private:
  std::string type_;
  Dictionary userInfo_;
  bool eligible_ = false;
  bool current_ = false;
};

}  // namespace

std::shared_ptr<UserActivity> DriveUserActivities::makeActivity(const std::string& type) {
  return std::make_shared<DriveUserActivity>(type);
}

}  // namespace vaelo
