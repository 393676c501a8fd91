// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include "platform/type_identifiers.h"

namespace vaelo {

/// Character classes and comparison by ICU.
class IcuCharacterClasses : public CharacterClasses {
 public:
  bool containsIllegalCharacter(const std::string& text) override;
  bool containsControlCharacter(const std::string& text) override;
  bool containsNewline(const std::string& text) override;
  std::string trimmingWhitespaceAndNewlines(const std::string& text) override;
  bool localizedCaseInsensitiveEquals(const std::string& a, const std::string& b) override;
};

}  // namespace vaelo
