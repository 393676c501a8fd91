// SPDX-License-Identifier: GPL-3.0-or-later
#include "tests/support/memory_characters.h"

#include <algorithm>
#include <cctype>

#include "platform/url.h"

namespace vaelo {

bool MemoryCharacters::containsIllegalCharacter(const std::string& text) {
  // The decoder refuses what is not UTF-8; a percent sign is none of its business here.
  std::string bytes = text;
  std::replace(bytes.begin(), bytes.end(), '%', '_');
  return !percentDecoded(bytes) || text.find_first_of(alsoIllegal) != std::string::npos;
}

bool MemoryCharacters::containsControlCharacter(const std::string& text) {
  return std::any_of(text.begin(), text.end(), [](unsigned char c) { return c < 0x20 || c == 0x7f; });
}

bool MemoryCharacters::containsNewline(const std::string& text) {
  return text.find_first_of("\n\r\v\f") != std::string::npos;
}

std::string MemoryCharacters::trimmingWhitespaceAndNewlines(const std::string& text) {
  constexpr const char* blanks = " \t\n\r\v\f";
  const std::size_t first = text.find_first_not_of(blanks);
  return first == std::string::npos ? "" : text.substr(first, text.find_last_not_of(blanks) - first + 1);
}

bool MemoryCharacters::localizedCaseInsensitiveEquals(const std::string& a, const std::string& b) {
  return std::equal(a.begin(), a.end(), b.begin(), b.end(),
                    [](unsigned char x, unsigned char y) { return std::tolower(x) == std::tolower(y); });
}

}  // namespace vaelo
