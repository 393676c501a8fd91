// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <map>

#include "platform/formatting.h"

namespace vaelo {

/// Plain English, and dates as seconds.
class MemoryFormatting : public Formatting {
 public:
  /// Texts by key, instead of the key itself.
  std::map<std::string, std::string> translations;

  std::string byteCount(std::uint64_t bytes, ByteCountStyle style, bool withUnit = true) override;
  std::string localizedDate(Date date, DateStyle dateStyle, DateStyle timeStyle) override;
  std::string localizedString(const std::string& key) override;
  std::string localizedCount(const std::string& key, std::int64_t count) override;
  std::string localizedAmount(const std::string& key, double number, const std::string& text) override;
  std::string filled(const std::string& format, const std::vector<std::string>& arguments) override;
};

}  // namespace vaelo
