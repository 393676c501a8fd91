// SPDX-License-Identifier: GPL-3.0-or-later
#include "tests/support/recording_log.h"

#include <algorithm>

namespace vaelo {

void RecordingLog::write(LogType, const std::string& line) {
  const std::lock_guard lock(mutex_);
  lines_.push_back(line);
}

std::vector<std::string> RecordingLog::lines() const {
  const std::lock_guard lock(mutex_);
  return lines_;
}

std::size_t RecordingLog::count(const std::string& level, const std::string& message) const {
  const std::lock_guard lock(mutex_);
  return static_cast<std::size_t>(std::count_if(lines_.begin(), lines_.end(), [&](const std::string& line) {
    // "(VLO)[LEVEL] function (line) message"
    const std::string prefix = "(VLO)[" + level + "] ";
    const std::size_t end = line.find(") ", prefix.size());
    return line.compare(0, prefix.size(), prefix) == 0 && end != std::string::npos && line.substr(end + 2) == message;
  }));
}

bool RecordingLog::has(const std::string& level, const std::string& message) const { return count(level, message) > 0; }

void RecordingLog::clear() {
  const std::lock_guard lock(mutex_);
  lines_.clear();
}

}  // namespace vaelo
