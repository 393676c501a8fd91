// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/files/glib_log.h"

#include <glib.h>

namespace vaelo {

namespace {
constexpr const char* Domain = "vaelo-drive";
}

void GLibLog::write(LogType type, const std::string& line) {
  const GLogLevelFlags level = type == LogType::Error   ? G_LOG_LEVEL_WARNING
                               : type == LogType::Debug ? G_LOG_LEVEL_DEBUG
                                                        : G_LOG_LEVEL_MESSAGE;
  // A line may quote a name that is no UTF-8.
  char* text = g_utf8_make_valid(line.c_str(), static_cast<gssize>(line.size()));
  g_log_structured(Domain, level, "MESSAGE", "%s", text);
  g_free(text);
}

bool GLibLog::wantsDebug() { return !g_log_writer_default_would_drop(G_LOG_LEVEL_DEBUG, Domain); }

void GLibActivityTracing::recordUserAction(const std::string& label) {
  g_log_structured(Domain, G_LOG_LEVEL_DEBUG, "USER_ACTION", label.c_str(), "MESSAGE", "User action: %s", label.c_str());
}

}  // namespace vaelo
