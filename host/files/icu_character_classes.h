// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <unicode/coll.h>

#include <memory>

#include "platform/type_identifiers.h"

namespace vaelo {

/// Character classes and comparison by ICU.
class IcuCharacterClasses : public CharacterClasses {
 public:
  IcuCharacterClasses();
  bool containsIllegalCharacter(const std::string& text) override;
  bool containsControlCharacter(const std::string& text) override;
  bool containsNewline(const std::string& text) override;
  std::string trimmingWhitespaceAndNewlines(const std::string& text) override;
  bool localizedCaseInsensitiveEquals(const std::string& a, const std::string& b) override;

 private:
  std::unique_ptr<const icu::Collator>
      collator_;  // costly to make, safe to compare with from any thread; null if ICU has no data
};

}  // namespace vaelo
