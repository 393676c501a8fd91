// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/support/texts.h"

#include <unicode/numberformatter.h>

#include <string_view>

#include "host/files/user_locale.h"

namespace vaelo {

std::string filled(const char* format, std::initializer_list<std::string> values) {
  const std::string_view text = format;
  std::string result;
  std::size_t next = 0;
  for (std::size_t i = 0; i < text.size(); ++i) {
    const bool numbered =
        text[i] == '%' && i + 3 < text.size() && text[i + 1] >= '1' && text[i + 1] <= '9' && text.substr(i + 2, 2) == "$s";
    if (!numbered && text.substr(i, 2) != "%s") {
      result.push_back(text[i]);
      // Of "%%" one is for people.
      if (text.substr(i, 2) == "%%") ++i;
      continue;
    }
    const std::size_t index = numbered ? static_cast<std::size_t>(text[i + 1] - '1') : next++;
    if (index < values.size()) result += values.begin()[index];
    i += numbered ? 3 : 1;
  }
  return result;
}

// The empty text is the key of the catalogue's header.
std::string translated(const std::string& text) { return text.empty() ? text : gettext(text.c_str()); }

std::string numberText(std::int64_t number) {
  static const icu::number::LocalizedNumberFormatter format =
      icu::number::NumberFormatter::withLocale(icu::Locale::createCanonical(userLocale("LC_NUMERIC").c_str()));
  UErrorCode status = U_ZERO_ERROR;
  std::string text;
  format.formatInt(number, status).toString(status).toUTF8String(text);
  return U_SUCCESS(status) ? text : std::to_string(number);
}

std::string listedText(const std::string& first, const std::string& second) {
  // TRANSLATORS: two facts about an item, read aloud or shown in one line.
  return filled(_("%s, %s"), {first, second});
}

std::string sentences(const std::string& first, const std::string& second) {
  // TRANSLATORS: two whole sentences, one after the other.
  return filled(_("%s %s"), {first, second});
}

}  // namespace vaelo
