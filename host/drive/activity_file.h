// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <map>
#include <string>

#include "platform/date.h"
#include "platform/result.h"

namespace vaelo {

/// What a device tells the others that its user is doing.
struct ActivityRecord {
  std::string deviceName;
  std::string type;
  std::map<std::string, std::string> userInfo;
  Date since;
  bool operator==(const ActivityRecord&) const = default;
};

/// The text of the activity's file: a key file with the groups Activity and UserInfo. Keys of the user info that are no
/// plain words are left out.
std::string activityFileText(const ActivityRecord& record);

/// Reads what another device wrote, which is not trusted: an error, with the reason for the log, when the file is not
/// there, no small regular file, damaged, says no type, is more than a day old, or comes from the future. The name comes
/// without control and direction characters, and short enough to be shown. Blocks; any thread.
Result<ActivityRecord> readActivityFile(const std::string& path, Date now);

}  // namespace vaelo
