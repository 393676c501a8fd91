// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/files/icu_formatting.h"

#include <glib.h>
#include <libintl.h>
#include <unicode/datefmt.h>
#include <unicode/numberformatter.h>

#include <array>
#include <memory>

namespace vaelo {

namespace {

struct CountTexts {
  const char* key;
  const char* one;
  const char* many;
};

constexpr CountTexts Counts[] = {
    {".DICT.ITEMS.%d", "%@ item", "%@ items"},
    {".DICT.ITEMS_SELECTED.%d", "%@ Item Selected", "%@ Items Selected"},
    {".DICT.MOVE_ITEMS.%d", "Move %@ Item", "Move %@ Items"},
    {".DICT.CANNOT_MOVE_ITEMS.%d", "%@ item can’t be moved.", "%@ items can’t be moved."},
    {".DICT.CANNOT_DELETE_ITEMS.%d", "%@ item can’t be deleted.", "%@ items can’t be deleted."},
    {".DICT.AVAILABLE.%g", "%@ available", "%@ available"},
};

std::string countText(const std::string& key, unsigned long count) {
  for (const CountTexts& texts : Counts) {
    if (key == texts.key) return ngettext(texts.one, texts.many, count);
  }
  return key;
}

std::string localizedNumber(double number, int fractionDigits) {
  UErrorCode status = U_ZERO_ERROR;
  std::string text;
  icu::number::NumberFormatter::withLocale(icu::Locale::getDefault())
      .precision(icu::number::Precision::maxFraction(fractionDigits))
      .formatDouble(number, status)
      .toString(status)
      .toUTF8String(text);
  return U_SUCCESS(status) ? text : std::to_string(number);
}

struct Amount {
  double number;
  int fractionDigits;
  const char* unit;
};

Amount amountOf(std::uint64_t bytes, ByteCountStyle style) {
  constexpr std::array<const char*, 7> units{"bytes", "KB", "MB", "GB", "TB", "PB", "EB"};
  const double base = style == ByteCountStyle::Binary ? 1024 : 1000;
  auto number = static_cast<double>(bytes);
  std::size_t unit = 0;
  // What would be shown as 1000 of a unit is shown as 1 of the next.
  while (number >= base - 0.5 && unit + 1 < units.size()) {
    number /= base;
    ++unit;
  }
  const int digits = unit <= 1 ? 0 : unit == 2 ? 1 : 2;
  return {number, digits, units[unit]};
}

icu::DateFormat::EStyle icuStyle(DateStyle style) {
  switch (style) {
    case DateStyle::None: return icu::DateFormat::kNone;
    case DateStyle::Short: return icu::DateFormat::kShort;
    case DateStyle::Medium: return icu::DateFormat::kMedium;
    case DateStyle::Long: return icu::DateFormat::kLong;
  }
  return icu::DateFormat::kNone;
}

}  // namespace

std::string IcuFormatting::byteCount(std::uint64_t bytes, ByteCountStyle style, bool withUnit) {
  const Amount amount = amountOf(bytes, style);
  if (!withUnit) {
    // Plain digits: the caller reads the number back.
    std::array<char, 64> digits{};
    g_ascii_formatd(digits.data(), static_cast<int>(digits.size()), "%.2f", amount.number);
    return digits.data();
  }
  const std::string number = localizedNumber(amount.number, amount.fractionDigits);
  return filled(gettext("%@ %@"), {number, gettext(amount.unit)});
}

std::string IcuFormatting::localizedDate(Date date, DateStyle dateStyle, DateStyle timeStyle) {
  const std::unique_ptr<icu::DateFormat> format(icu::DateFormat::createDateTimeInstance(
      icuStyle(dateStyle), icuStyle(timeStyle), icu::Locale::getDefault()));
  if (!format) return "";
  const auto milliseconds = std::chrono::duration<double, std::milli>(date.time_since_epoch()).count();
  icu::UnicodeString text;
  format->format(static_cast<UDate>(milliseconds), text);
  std::string result;
  return text.toUTF8String(result);
}

std::string IcuFormatting::localizedString(const std::string& key) { return key.empty() ? key : gettext(key.c_str()); }

std::string IcuFormatting::localizedCount(const std::string& key, std::int64_t count) {
  return filled(countText(key, static_cast<unsigned long>(count < 0 ? -count : count)),
                {localizedNumber(static_cast<double>(count), 0)});
}

std::string IcuFormatting::localizedAmount(const std::string& key, double number, const std::string& text) {
  return filled(countText(key, number == 1 ? 1 : 2), {text});
}

std::string IcuFormatting::filled(const std::string& format, const std::vector<std::string>& arguments) {
  std::string result;
  std::size_t next = 0;
  for (std::size_t i = 0; i < format.size(); ++i) {
    const bool numbered = format[i] == '%' && i + 3 < format.size() && g_ascii_isdigit(format[i + 1]) &&
                          format.compare(i + 2, 2, "$@") == 0;
    const bool plain = format.compare(i, 2, "%@") == 0;
    if (!numbered && !plain) {
      result.push_back(format[i]);
      continue;
    }
    const std::size_t index = numbered ? static_cast<std::size_t>(format[i + 1] - '1') : next++;
    if (index < arguments.size()) result += arguments[index];
    i += numbered ? 3 : 1;
  }
  return result;
}

}  // namespace vaelo
