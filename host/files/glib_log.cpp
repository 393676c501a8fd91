// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/files/glib_log.h"

#include <glib.h>

#include "host/support/glib_ptr.h"

namespace vaelo {

namespace {
constexpr const char* Domain = "vaelo-drive";
}

GLibLog::GLibLog() {
  // In one stream, so that lines stand in the order in which they were written. GLib takes it once, before any thread.
  [[maybe_unused]] static const bool set = (g_log_writer_default_set_use_stderr(TRUE), true);
}

void GLibLog::write(LogType type, const std::string& line) {
  const GLogLevelFlags level = type == LogType::Error   ? G_LOG_LEVEL_WARNING
                               : type == LogType::Debug ? G_LOG_LEVEL_DEBUG
                                                        : G_LOG_LEVEL_MESSAGE;
  // A line may quote a name that is no UTF-8, or one made to look like the next line.
  std::string text = takeString(g_utf8_make_valid(line.data(), static_cast<gssize>(line.size())));
  for (std::size_t at = 0; (at = text.find_first_of("\r\n", at)) != std::string::npos; at += 2) {
    text.replace(at, 1, text[at] == '\n' ? "\\n" : "\\r");
  }
  g_log_structured(Domain, level, "MESSAGE", "%s", text.c_str());
}

bool GLibLog::wantsDebug() { return !g_log_writer_default_would_drop(G_LOG_LEVEL_DEBUG, Domain); }

void GLibActivityTracing::recordUserAction(const std::string& label) {
  g_log_structured(Domain, G_LOG_LEVEL_DEBUG, "USER_ACTION", label.c_str(), "MESSAGE", "User action: %s", label.c_str());
}

}  // namespace vaelo
