// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/files/icu_character_classes.h"

#include <unicode/uchar.h>
#include <unicode/unistr.h>
#include <unicode/utf8.h>

#include "host/files/user_locale.h"

namespace vaelo {

namespace {

/// True when `test` holds for a character; bytes that are no UTF-8 are given as a negative one.
template <typename Test>
bool anyCharacter(const std::string& text, Test test) {
  const auto length = static_cast<std::int32_t>(text.size());
  for (std::int32_t at = 0; at < length;) {
    UChar32 character = 0;
    U8_NEXT(text.data(), at, length, character);
    if (test(character)) return true;
  }
  return false;
}

bool isNewline(UChar32 c) {
  return c == 0x0A || c == 0x0B || c == 0x0C || c == 0x0D || c == 0x85 || c == 0x2028 || c == 0x2029;
}

bool isTrimmed(UChar32 c) { return c >= 0 && (isNewline(c) || c == '\t' || u_charType(c) == U_SPACE_SEPARATOR); }

}  // namespace

IcuCharacterClasses::IcuCharacterClasses() {
  UErrorCode status = U_ZERO_ERROR;
  std::unique_ptr<icu::Collator> collator(
      icu::Collator::createInstance(icu::Locale::createCanonical(userLocale("LC_COLLATE").c_str()), status));
  if (U_FAILURE(status)) return;
  collator->setStrength(icu::Collator::SECONDARY);
  collator_ = std::move(collator);
}

bool IcuCharacterClasses::containsIllegalCharacter(const std::string& text) {
  return anyCharacter(text, [](UChar32 c) { return c < 0 || u_charType(c) == U_UNASSIGNED || U_IS_UNICODE_NONCHAR(c); });
}

bool IcuCharacterClasses::containsControlCharacter(const std::string& text) {
  // Format characters are letters' helpers (joiners, direction marks) in many languages, so they may stand.
  return anyCharacter(text, [](UChar32 c) { return c >= 0 && u_charType(c) == U_CONTROL_CHAR; });
}

bool IcuCharacterClasses::containsNewline(const std::string& text) { return anyCharacter(text, isNewline); }

std::string IcuCharacterClasses::trimmingWhitespaceAndNewlines(const std::string& text) {
  const auto length = static_cast<std::int32_t>(text.size());
  std::int32_t start = 0;
  for (std::int32_t at = 0; at < length; start = at) {
    UChar32 character = 0;
    U8_NEXT(text.data(), at, length, character);
    if (!isTrimmed(character)) break;
  }
  std::int32_t end = length;
  for (std::int32_t at = length; at > start; end = at) {
    UChar32 character = 0;
    U8_PREV(text.data(), start, at, character);
    if (!isTrimmed(character)) break;
  }
  return text.substr(static_cast<std::size_t>(start), static_cast<std::size_t>(end - start));
}

bool IcuCharacterClasses::localizedCaseInsensitiveEquals(const std::string& a, const std::string& b) {
  return collator_ ? collator_->equals(icu::UnicodeString::fromUTF8(a), icu::UnicodeString::fromUTF8(b)) : a == b;
}

}  // namespace vaelo
