// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <mutex>
#include <string>
#include <vector>

#include "platform/logging.h"

namespace vaelo {

/// A log that keeps its lines. Safe from any thread.
class RecordingLog : public LogSink {
 public:
  void write(LogType type, const std::string& line) override;
  std::vector<std::string> lines() const;
  /// True when a line has the level ("ERROR", "WARNING", "INFO", "DEBUG") and exactly the message.
  bool has(const std::string& level, const std::string& message) const;
  std::size_t count(const std::string& level, const std::string& message) const;
  void clear();

 private:
  mutable std::mutex mutex_;
  std::vector<std::string> lines_;
};

}  // namespace vaelo
