// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/files/icu_formatting.h"

#include <glib.h>
#include <unicode/plurrule.h>

#include <cmath>
#include <iterator>

#include "host/files/user_locale.h"
#include "host/support/message_catalogue.h"
#include "host/support/texts.h"

namespace vaelo {

namespace {

struct CountTexts {
  const char* key;
  const char* one;
  const char* many;
};

constexpr CountTexts Counts[] = {
    {".DICT.ITEMS.%d", NP_("%@ item", "%@ items")},
    {".DICT.ITEMS_SELECTED.%d", NP_("%@ Item Selected", "%@ Items Selected")},
    {".DICT.MOVE_ITEMS.%d", NP_("Move %@ Item", "Move %@ Items")},
    {".DICT.CANNOT_MOVE_ITEMS.%d", NP_("%@ item can’t be moved.", "%@ items can’t be moved.")},
    {".DICT.CANNOT_DELETE_ITEMS.%d", NP_("%@ item can’t be deleted.", "%@ items can’t be deleted.")},
    // TRANSLATORS: %1$@ is a number that may have a fraction, %2$@ the same with its unit, as in "5.25 GB available".
    {".DICT.AVAILABLE.%g", NP_("%2$@ available", "%2$@ available")},
};

/// The text for a counted key by its English forms; any other key is its own English text.
std::string textFor(const std::string& key, std::uint64_t count) {
  for (const CountTexts& texts : Counts) {
    if (key == texts.key) return ngettext(texts.one, texts.many, static_cast<unsigned long>(count));
  }
  return gettext(key.c_str());
}

/// A count whose plural form is that of the number: gettext's rules know whole numbers alone.
std::uint64_t countLike(double number) {
  constexpr std::uint64_t genitive = 2;  // where fractions have a form of their own, it is the one after two: "1,5 файла"
  constexpr int enough = 102;            // counts, among which each form is met
  if (number >= 0 && number < 1e15 && number == std::floor(number)) return static_cast<std::uint64_t>(number);
  UErrorCode status = U_ZERO_ERROR;
  const std::unique_ptr<icu::PluralRules> rules(icu::PluralRules::forLocale(icu::Locale(messageLocale().c_str()), status));
  if (U_FAILURE(status) || !rules) return genitive;
  const icu::UnicodeString form = rules->select(number);
  for (int count = 0; count < enough; ++count) {
    if (rules->select(count) == form) return static_cast<std::uint64_t>(count);
  }
  return genitive;
}

struct Amount {
  double number;
  int fractionDigits;
  const char* format;  ///< with the unit; null for bytes
};

Amount amountOf(std::uint64_t bytes, ByteCountStyle style) {
  struct Unit {
    const char* format;
    int fractionDigits;
  };
  constexpr Unit units[] = {{nullptr, 0},     {N_("%@ KB"), 0}, {N_("%@ MB"), 1}, {N_("%@ GB"), 2},
                            {N_("%@ TB"), 2}, {N_("%@ PB"), 2}, {N_("%@ EB"), 2}};
  const double base = style == ByteCountStyle::Binary ? 1024 : 1000;
  auto number = static_cast<double>(bytes);
  std::size_t at = 0;
  // What would be rounded to 1000 of a unit is shown as 1 of the next.
  const auto limit = [&] { return base - (at == 0 ? 0 : 0.5 / std::pow(10, units[at].fractionDigits)); };
  while (number >= limit() && at + 1 < std::size(units)) {
    number /= base;
    ++at;
  }
  return {number, units[at].fractionDigits, units[at].format};
}

icu::DateFormat::EStyle icuStyle(DateStyle style) {
  switch (style) {
    case DateStyle::None:
      return icu::DateFormat::kNone;
    case DateStyle::Short:
      return icu::DateFormat::kShort;
    case DateStyle::Medium:
      return icu::DateFormat::kMedium;
    case DateStyle::Long:
      return icu::DateFormat::kLong;
  }
  return icu::DateFormat::kNone;
}

}  // namespace

IcuFormatting::IcuFormatting() : IcuFormatting(userLocale("LC_NUMERIC"), userLocale("LC_TIME")) {}

IcuFormatting::IcuFormatting(const std::string& numbers, const std::string& dates)
    : dates_(icu::Locale::createCanonical(dates.c_str())) {
  for (int digits = 0; digits < 3; ++digits) {
    numbers_[digits] = icu::number::NumberFormatter::withLocale(icu::Locale::createCanonical(numbers.c_str()))
                           .precision(icu::number::Precision::maxFraction(digits))
                           .roundingMode(UNUM_ROUND_HALFUP);
  }
}

std::string IcuFormatting::localizedNumber(double number, int fractionDigits) const {
  UErrorCode status = U_ZERO_ERROR;
  std::string text;
  numbers_[fractionDigits].formatDouble(number, status).toString(status).toUTF8String(text);
  return U_SUCCESS(status) ? text : std::to_string(number);
}

std::string IcuFormatting::byteCount(std::uint64_t bytes, ByteCountStyle style, bool withUnit) {
  const Amount amount = amountOf(bytes, style);
  if (!withUnit) {
    const double scale = amount.fractionDigits == 0 ? 1 : amount.fractionDigits == 1 ? 10 : 100;
    char digits[G_ASCII_DTOSTR_BUF_SIZE];
    return g_ascii_formatd(digits, sizeof digits, "%.12g", std::round(amount.number * scale) / scale);
  }
  const std::string number = localizedNumber(amount.number, amount.fractionDigits);
  if (!amount.format) return filled(ngettext("%@ byte", "%@ bytes", static_cast<unsigned long>(bytes)), {number});
  return filled(gettext(amount.format), {number});
}

std::string IcuFormatting::localizedDate(Date date, DateStyle dateStyle, DateStyle timeStyle) {
  if (dateStyle == DateStyle::None && timeStyle == DateStyle::None) return "";
  const auto milliseconds = std::chrono::duration<double, std::milli>(date.time_since_epoch()).count();
  icu::UnicodeString text;
  const std::lock_guard lock(mutex_);
  std::unique_ptr<icu::DateFormat>& format = dateFormats_[{dateStyle, timeStyle}];
  if (!format) format.reset(icu::DateFormat::createDateTimeInstance(icuStyle(dateStyle), icuStyle(timeStyle), dates_));
  if (!format) return "";
  format->format(static_cast<UDate>(milliseconds), text);
  std::string result;
  return text.toUTF8String(result);
}

std::string IcuFormatting::localizedString(const std::string& key) {
  // The empty key is that of the catalogue's header.
  return key.empty() ? key : textFor(key, 2);
}

std::string IcuFormatting::localizedCount(const std::string& key, std::int64_t count) {
  const std::uint64_t plain = count < 0 ? 0 - static_cast<std::uint64_t>(count) : static_cast<std::uint64_t>(count);
  return filled(textFor(key, plain), {localizedNumber(static_cast<double>(count), 0)});
}

std::string IcuFormatting::localizedAmount(const std::string& key, double number, const std::string& text) {
  char digits[G_ASCII_DTOSTR_BUF_SIZE];
  g_ascii_formatd(digits, sizeof digits, "%g", number);
  return filled(textFor(key, countLike(number)), {digits, text});
}

std::string IcuFormatting::filled(const std::string& format, const std::vector<std::string>& arguments) {
  std::string result;
  std::size_t next = 0;
  for (std::size_t i = 0; i < format.size(); ++i) {
    const bool numbered =
        format[i] == '%' && i + 3 < format.size() && g_ascii_isdigit(format[i + 1]) && format.compare(i + 2, 2, "$@") == 0;
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
