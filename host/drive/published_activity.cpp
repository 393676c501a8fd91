// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/drive/published_activity.h"

#include <utility>

namespace vaelo {

PublishedActivity::PublishedActivity(std::string type, std::weak_ptr<CurrentActivity> current)
    : type_(std::move(type)), current_(std::move(current)) {}

PublishedActivity::~PublishedActivity() { PublishedActivity::resignCurrent(); }

Dictionary PublishedActivity::userInfo() const {
  const std::lock_guard lock(mutex_);
  return userInfo_;
}

void PublishedActivity::setUserInfo(Dictionary userInfo) {
  {
    const std::lock_guard lock(mutex_);
    userInfo_ = std::move(userInfo);
  }
  if (const auto current = current_.lock()) current->changes(this, offered());
}

void PublishedActivity::setEligibleForBaton(bool eligible) {
  {
    const std::lock_guard lock(mutex_);
    eligible_ = eligible;
  }
  if (const auto current = current_.lock()) current->changes(this, offered());
}

void PublishedActivity::becomeCurrent() {
  if (const auto current = current_.lock()) current->becomes(this, offered());
}

void PublishedActivity::resignCurrent() {
  if (const auto current = current_.lock()) current->resigns(this);
}

std::optional<ActivityRecord> PublishedActivity::offered() const {
  const std::lock_guard lock(mutex_);
  if (!eligible_) return std::nullopt;
  ActivityRecord record;
  record.type = type_;
  for (const auto& [key, value] : userInfo_) {
    if (const std::string* text = value.get<std::string>()) record.userInfo[key] = *text;
  }
  return record;
}

}  // namespace vaelo
