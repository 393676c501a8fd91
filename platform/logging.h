// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <string>

namespace vaelo {

enum class LogType { Error, Default, Debug };

/// The platform's log. Safe from any thread.
class LogSink {
 public:
  virtual ~LogSink() = default;
  /// `line` is whole: prefix, level, function, source line and message.
  virtual void write(LogType type, const std::string& line) = 0;
  /// False when debug lines go nowhere, so that long ones need not be made.
  virtual bool wantsDebug() { return true; }
};

/// Records what the user did, for tracing tools. Safe from any thread.
class ActivityTracing {
 public:
  virtual ~ActivityTracing() = default;
  virtual void recordUserAction(const std::string& label) = 0;
};

}  // namespace vaelo
