// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <cstdint>
#include <string>
#include <vector>

#include "platform/date.h"

namespace vaelo {

enum class ByteCountStyle { File, Binary };
enum class DateStyle { None = 0, Short = 1, Medium = 2, Long = 3 };

/// Words and numbers for people, in their language. Safe from any thread.
class Formatting {
 public:
  virtual ~Formatting() = default;
  /// File: 1000-based; Binary: 1024-based. Without the unit the number alone, in plain digits with a decimal point.
  virtual std::string byteCount(std::uint64_t bytes, ByteCountStyle style, bool withUnit = true) = 0;
  virtual std::string localizedDate(Date date, DateStyle dateStyle, DateStyle timeStyle) = 0;
  /// The text for a key of the main string table; the key itself when there is no translation.
  virtual std::string localizedString(const std::string& key) = 0;
  /// The text for a key that ends in a count's format (".DICT.ITEMS.%d"), plural by the count, with the count filled in.
  virtual std::string localizedCount(const std::string& key, std::int64_t count) = 0;
  /// The text for a key that ends in "%g", plural by the number, with the number's own text filled in.
  virtual std::string localizedAmount(const std::string& key, double number, const std::string& text) = 0;
  /// Fills "%@", "%1$@" ... of an already localized format.
  virtual std::string filled(const std::string& format, const std::vector<std::string>& arguments) = 0;
};

}  // namespace vaelo
