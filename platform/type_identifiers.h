// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <optional>
#include <string>

namespace vaelo {

/// Uniform type identifiers. Safe from any thread; never blocks for long.
class TypeIdentifiers {
 public:
  virtual ~TypeIdentifiers() = default;
  /// The preferred type of files with the extension (without a dot, any case); a well-known one where there is one, else
  /// one made for the extension, so it is empty only for an empty extension.
  virtual std::optional<std::string> preferredIdentifierForExtension(const std::string& extension) = 0;
  /// True when `type` is `other` or a kind of it.
  virtual bool conformsTo(const std::string& type, const std::string& other) = 0;
  /// What a person calls the type; nothing when it is not known.
  virtual std::optional<std::string> description(const std::string& type) = 0;
};

/// Which characters a name may hold. Text is UTF-8; what is not valid UTF-8 counts as illegal.
class CharacterClasses {
 public:
  virtual ~CharacterClasses() = default;
  virtual bool containsIllegalCharacter(const std::string& text) = 0;
  virtual bool containsControlCharacter(const std::string& text) = 0;
  virtual bool containsNewline(const std::string& text) = 0;
  virtual std::string trimmingWhitespaceAndNewlines(const std::string& text) = 0;
  /// Equality under the user's collation without regard to case.
  virtual bool localizedCaseInsensitiveEquals(const std::string& a, const std::string& b) = 0;
};

}  // namespace vaelo
