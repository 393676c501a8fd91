// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include "platform/type_identifiers.h"

namespace vaelo {

/// Character classes of ASCII and a little more; of the rest it knows what is UTF-8.
class MemoryCharacters : public CharacterClasses {
 public:
  /// Bytes that a test wants to be illegal too.
  std::string alsoIllegal;

  bool containsIllegalCharacter(const std::string& text) override;
  bool containsControlCharacter(const std::string& text) override;
  bool containsNewline(const std::string& text) override;
  std::string trimmingWhitespaceAndNewlines(const std::string& text) override;
  bool localizedCaseInsensitiveEquals(const std::string& a, const std::string& b) override;
};

}  // namespace vaelo
