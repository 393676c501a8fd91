// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <concepts>
#include <optional>
#include <string>
#include <string_view>
#include <type_traits>
#include <vector>

#include "platform/error.h"
#include "platform/value.h"

namespace vaelo {

/// One argument of a log format, as text; "(null)" for what is absent.
class LogArgument {
 public:
  LogArgument(const char* text) : text_(text ? text : "(null)") {}
  LogArgument(std::string text) : text_(std::move(text)) {}
  LogArgument(const URL& url) : text_(url.absoluteString()) {}
  LogArgument(const Error& error) : text_(error.description()) {}
  LogArgument(const Value& value) : text_(value.description()) {}
  LogArgument(Date date) : LogArgument(Value(date)) {}
  LogArgument(bool flag) : text_(flag ? "1" : "0") {}
  template <std::integral T>
  requires(!std::same_as<T, bool>) LogArgument(T number) : text_(std::to_string(number)) {}
  LogArgument(double number) : text_(std::to_string(number)) {}
  template <typename T>
  LogArgument(const std::optional<T>& value) : text_(value ? LogArgument(*value).text_ : "(null)") {}
  template <typename T>
  LogArgument(const std::vector<T>& list) {
    text_ = "(";
    for (const T& entry : list) text_ += (text_.size() > 1 ? ", " : "") + LogArgument(entry).text_;
    text_ += ")";
  }
  /// An object with a class name or a description.
  template <typename T>
  requires requires(const T& object) {
    { object->className() } -> std::convertible_to<std::string>;
  }
  LogArgument(const T& object) : text_(object ? object->className() : "(null)") {}
  template <typename T>
  requires requires(const T& object) {
    { object->description() } -> std::convertible_to<std::string>;
  }
  LogArgument(const T& object) : text_(object ? object->description() : "(null)") {}

  const std::string& text() const { return text_; }

 private:
  std::string text_;
};

using LogArguments = std::vector<LogArgument>;

enum class LogLevel { Error, Warning, Info, Debug };

/// Fills the conversions of `format` ("%@", "%{public}@", "%d", "%s", "%1$@" ...) with the arguments; "%%" is a percent
/// sign.
std::string logFormatted(const std::string& format, const std::vector<LogArgument>& arguments);
/// Writes a line "(VLO)[LEVEL] function (line) message" to the platform's log.
void logLine(LogLevel level, const std::string& function, int line, const std::string& format,
             const std::vector<LogArgument>& arguments);
bool debugLinesAreWanted();
/// Records what the user did with activity tracing and logs it.
void logUserAction(const std::string& function, int line, const std::string& label);
/// The name that a line gets: `function`, or for a lambda that of the function around it, which `signature` tells (a
/// compiler's __PRETTY_FUNCTION__).
std::string functionInLog(const char* function, std::string_view signature);

}  // namespace vaelo

#define VLO_FUNCTION ::vaelo::functionInLog(__func__, __PRETTY_FUNCTION__)
#define VLO_LOG(level, format, ...) \
  ::vaelo::logLine(level, VLO_FUNCTION, __LINE__, format, ::vaelo::LogArguments{__VA_ARGS__})
#define VLO_ERROR(format, ...) VLO_LOG(::vaelo::LogLevel::Error, format __VA_OPT__(, ) __VA_ARGS__)
#define VLO_WARNING(format, ...) VLO_LOG(::vaelo::LogLevel::Warning, format __VA_OPT__(, ) __VA_ARGS__)
#define VLO_INFO(format, ...) VLO_LOG(::vaelo::LogLevel::Info, format __VA_OPT__(, ) __VA_ARGS__)
// Its arguments are not made into text where nobody reads debug lines.
#define VLO_DEBUG(format, ...) \
  (!::vaelo::debugLinesAreWanted() ? (void)0 : VLO_LOG(::vaelo::LogLevel::Debug, format __VA_OPT__(, ) __VA_ARGS__))
#define VLO_USER_ACTION(label) ::vaelo::logUserAction(VLO_FUNCTION, __LINE__, label)
