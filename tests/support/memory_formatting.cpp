// SPDX-License-Identifier: GPL-3.0-or-later
#include "tests/support/memory_formatting.h"

#include <cctype>
#include <cmath>
#include <iterator>
#include <sstream>

namespace vaelo {

namespace {

struct Unit {
  const char* name;
  int fractionDigits;
};
constexpr Unit Units[] = {{"bytes", 0}, {"KB", 0}, {"MB", 1}, {"GB", 2}, {"TB", 2}, {"PB", 2}, {"EB", 2}};

std::string plain(double number, int precision = 12) {
  std::ostringstream text;
  text.imbue(std::locale::classic());
  text.precision(precision);
  text << number;
  return text.str();
}

}  // namespace

std::string MemoryFormatting::byteCount(std::uint64_t bytes, ByteCountStyle style, bool withUnit) {
  const double base = style == ByteCountStyle::Binary ? 1024 : 1000;
  auto number = static_cast<double>(bytes);
  std::size_t at = 0;
  // What would be rounded to 1000 of a unit is shown as 1 of the next.
  while (at + 1 < std::size(Units) && number >= base - (at ? 0.5 / std::pow(10, Units[at].fractionDigits) : 0)) {
    number /= base;
    ++at;
  }
  const double scale = std::pow(10, Units[at].fractionDigits);
  const std::string text = plain(std::round(number * scale) / scale);
  if (!withUnit) return text;
  const bool isGrouped = number >= 1000;
  return (isGrouped ? text.substr(0, 1) + "," + text.substr(1) : text) + " " + (bytes == 1 ? "byte" : Units[at].name);
}

// Longer in a longer style.
std::string MemoryFormatting::localizedDate(Date date, DateStyle dateStyle, DateStyle timeStyle) {
  if (dateStyle == DateStyle::None && timeStyle == DateStyle::None) return "";
  const auto seconds = std::chrono::duration_cast<std::chrono::seconds>(date.time_since_epoch()).count();
  return std::to_string(seconds) + " s, date " + std::to_string(static_cast<int>(dateStyle)) + ", time " +
         std::to_string(static_cast<int>(timeStyle)) + std::string(static_cast<std::size_t>(dateStyle), '.');
}

std::string MemoryFormatting::localizedString(const std::string& key) {
  const auto found = translations.find(key);
  return found == translations.end() ? key : found->second;
}

std::string MemoryFormatting::localizedCount(const std::string& key, std::int64_t count) {
  const std::string text = filled(localizedString(key), {std::to_string(count)});
  return text == key ? key + std::to_string(count) : text;
}

std::string MemoryFormatting::localizedAmount(const std::string& key, double number, const std::string& text) {
  const std::string result = filled(localizedString(key), {plain(number, 6), text});
  return result == key ? key + text : result;
}

std::string MemoryFormatting::filled(const std::string& format, const std::vector<std::string>& arguments) {
  std::string result;
  std::size_t next = 0;
  for (std::size_t i = 0; i < format.size(); ++i) {
    const bool isPlain = format.compare(i, 2, "%@") == 0;
    const bool isNumbered = format[i] == '%' && i + 3 < format.size() &&
                            std::isdigit(static_cast<unsigned char>(format[i + 1])) && format.compare(i + 2, 2, "$@") == 0;
    if (!isPlain && !isNumbered) {
      result.push_back(format[i]);
      continue;
    }
    const std::size_t index = isNumbered ? static_cast<std::size_t>(format[i + 1] - '1') : next++;
    if (index < arguments.size()) result += arguments[index];
    i += isNumbered ? 3 : 1;
  }
  return result;
}

}  // namespace vaelo
