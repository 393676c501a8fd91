// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include "platform/logging.h"

namespace vaelo {

/// The log of GLib under the domain "vaelo-drive": errors as warnings (nothing we log may end the program), the rest as
/// messages and debug lines. G_MESSAGES_DEBUG=vaelo-drive shows the debug lines.
class GLibLog : public LogSink {
 public:
  GLibLog();
  void write(LogType type, const std::string& line) override;
  bool wantsDebug() override;
};

/// User actions as debug lines with the field USER_ACTION, for tracing tools that read the journal.
class GLibActivityTracing : public ActivityTracing {
 public:
  void recordUserAction(const std::string& label) override;
};

}  // namespace vaelo
