// SPDX-License-Identifier: GPL-3.0-or-later
#include "tests/support/memory_characters.h"

#include <algorithm>
#include <cctype>
#include <string_view>
#include <vector>

#include "platform/url.h"

namespace vaelo {

namespace {

using Strings = std::vector<std::string_view>;

const Strings Newlines = {"\n", "\v", "\f", "\r", "\xC2\x85", "\xE2\x80\xA8", "\xE2\x80\xA9"};
const Strings Blanks = {" ", "\t", "\xC2\xA0", "\xE2\x80\x83", "\xE3\x80\x80"};
const Strings NoCharacters = {"\xEF\xBF\xBE", "\xEF\xBF\xBF"};

bool containsOne(const std::string& text, const Strings& parts) {
  return std::any_of(parts.begin(), parts.end(),
                     [&](std::string_view part) { return text.find(part) != std::string::npos; });
}

/// The length of the blank or newline that the text begins or ends with; 0 for none.
std::size_t blankAt(std::string_view text, bool atEnd) {
  for (const Strings* parts : {&Newlines, &Blanks}) {
    for (const std::string_view part : *parts) {
      if (atEnd ? text.ends_with(part) : text.starts_with(part)) return part.size();
    }
  }
  return 0;
}

/// ASCII and the letters of Western Europe.
std::string lowered(std::string text) {
  for (std::size_t i = 0; i < text.size(); ++i) {
    const auto c = static_cast<unsigned char>(text[i]);
    const bool isCapital = i > 0 && text[i - 1] == '\xC3' && c >= 0x80 && c <= 0x9E && c != 0x97;
    text[i] = static_cast<char>(isCapital ? c + 0x20 : std::tolower(c));
  }
  return text;
}

}  // namespace

bool MemoryCharacters::containsIllegalCharacter(const std::string& text) {
  // The decoder refuses what is not UTF-8; a percent sign is none of its business here.
  std::string bytes = text;
  std::replace(bytes.begin(), bytes.end(), '%', '_');
  return !percentDecoded(bytes) || containsOne(text, NoCharacters) || text.find_first_of(alsoIllegal) != std::string::npos;
}

bool MemoryCharacters::containsControlCharacter(const std::string& text) {
  for (std::size_t i = 0; i < text.size(); ++i) {
    const auto c = static_cast<unsigned char>(text[i]);
    if (c < 0x20 || c == 0x7f || (c >= 0x80 && c < 0xA0 && i > 0 && text[i - 1] == '\xC2')) return true;
  }
  return false;
}

bool MemoryCharacters::containsNewline(const std::string& text) { return containsOne(text, Newlines); }

std::string MemoryCharacters::trimmingWhitespaceAndNewlines(const std::string& text) {
  std::string_view rest = text;
  while (const std::size_t length = blankAt(rest, false)) rest.remove_prefix(length);
  while (const std::size_t length = blankAt(rest, true)) rest.remove_suffix(length);
  return std::string(rest);
}

bool MemoryCharacters::localizedCaseInsensitiveEquals(const std::string& a, const std::string& b) {
  return lowered(a) == lowered(b);
}

}  // namespace vaelo
