// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include "host/drive/drive_layout.h"
#include "platform/user_activity.h"

namespace vaelo {

class DriveUserActivities : public UserActivities {
 public:
  explicit DriveUserActivities(const DriveLayout& layout) : layout_(layout) {}
  std::shared_ptr<UserActivity> makeActivity(const std::string& type) override;

 private:
  const DriveLayout& layout_;
};

}  // namespace vaelo
