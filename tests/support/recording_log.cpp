// SPDX-License-Identifier: GPL-3.0-or-later
#include "tests/support/recording_log.h"

#include <algorithm>
#include <cstdio>

namespace vaelo {

namespace {

/// "LEVEL message" of "(VLO)[LEVEL] function (line) message".
std::string levelAndMessage(const std::string& line) {
  const std::size_t open = line.find('[');
  const std::size_t close = line.find(']');
  const std::size_t end = close == std::string::npos ? close : line.find(") ", close);
  if (!line.starts_with("(VLO)[") || end == std::string::npos) return line;
  return line.substr(open + 1, close - open - 1) + " " + line.substr(end + 2);
}

}  // namespace

void RecordingLog::write(LogType type, const std::string& line) {
  const std::lock_guard lock(mutex_);
  lines_.push_back(line);
  types_.push_back(type);
  if (echoes) std::fprintf(stderr, "%s\n", line.c_str());
}

std::vector<std::string> RecordingLog::lines() const {
  const std::lock_guard lock(mutex_);
  return lines_;
}

std::vector<LogType> RecordingLog::types() const {
  const std::lock_guard lock(mutex_);
  return types_;
}

std::vector<std::string> RecordingLog::messages() const {
  std::vector<std::string> result = lines();
  std::transform(result.begin(), result.end(), result.begin(), levelAndMessage);
  return result;
}

std::size_t RecordingLog::count(const std::string& level, const std::string& message) const {
  const std::vector<std::string> all = messages();
  return static_cast<std::size_t>(std::count(all.begin(), all.end(), level + " " + message));
}

bool RecordingLog::has(const std::string& level, const std::string& message) const { return count(level, message) > 0; }

void RecordingLog::clear() {
  const std::lock_guard lock(mutex_);
  lines_.clear();
  types_.clear();
}

}  // namespace vaelo
