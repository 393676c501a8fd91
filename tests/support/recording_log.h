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
  bool wantsDebug() override { return debugIsWanted; }
  std::vector<std::string> lines() const;
  /// The type of each line.
  std::vector<LogType> types() const;
  /// "LEVEL message" of each line; lines without a level as they are.
  std::vector<std::string> messages() const;
  /// True when a line has the level ("ERROR", "WARNING", "INFO", "DEBUG") and exactly the message.
  bool has(const std::string& level, const std::string& message) const;
  std::size_t count(const std::string& level, const std::string& message) const;
  void clear();

  bool debugIsWanted = true;
  bool echoes = false;  ///< to the error stream, which outlives the program

 private:
  mutable std::mutex mutex_;
  std::vector<std::string> lines_;  // guarded by mutex_
  std::vector<LogType> types_;      // guarded by mutex_
};

}  // namespace vaelo
