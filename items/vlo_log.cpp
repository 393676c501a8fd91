// SPDX-License-Identifier: GPL-3.0-or-later
#include "items/vlo_log.h"

#include <cctype>

#include "platform/platform.h"

namespace vaelo {

std::string logFormatted(const std::string& format, const std::vector<LogArgument>& arguments) {
  std::string text;
  std::size_t next = 0;
  for (std::size_t i = 0; i < format.size(); ++i) {
    if (format[i] != '%' || i + 1 == format.size()) {
      text.push_back(format[i]);
      continue;
    }
    ++i;
    if (format[i] == '%') {
      text.push_back('%');
      continue;
    }
    std::size_t index = next;
    const std::size_t dollar = format.find('$', i);
    if (std::isdigit(static_cast<unsigned char>(format[i])) && dollar == i + 1) {
      index = static_cast<std::size_t>(format[i] - '1');
      i = dollar + 1;
    } else {
      ++next;
    }
    if (format[i] == '{') i = format.find('}', i) + 1;
    while (i < format.size() && format[i] == 'l') ++i;
    text += index < arguments.size() ? arguments[index].text() : "(null)";
  }
  return text;
}

void logLine(LogLevel level, const std::string& function, int line, const std::string& format,
             const std::vector<LogArgument>& arguments) {
  static constexpr const char* names[] = {"ERROR", "WARNING", "INFO", "DEBUG"};
  const LogType type = level == LogLevel::Error   ? LogType::Error
                       : level == LogLevel::Debug ? LogType::Debug
                                                  : LogType::Default;
  const std::string prefix = logFormatted("(VLO)[%@] %s (%d) ", {names[static_cast<int>(level)], function, line});
  Platform::current().log.write(type, prefix + logFormatted(format, arguments));
}

std::string functionInLog(const char* function, std::string_view signature) {
  const std::string_view name = function;
  if (name != "operator()") return function;
  const std::string_view around = signature.substr(0, signature.find("::<lambda"));
  const std::string_view unqualified = around.substr(0, around.find('('));
  const std::size_t last = unqualified.rfind("::");
  return std::string(last == std::string_view::npos ? unqualified : unqualified.substr(last + 2));
}

bool debugLinesAreWanted() { return Platform::current().log.wantsDebug(); }

void logUserAction(const std::string& function, int line, const std::string& label) {
  Platform::current().activityTracing.recordUserAction(label);
  logLine(LogLevel::Info, function, line, "================= %s", {label});
}

}  // namespace vaelo
