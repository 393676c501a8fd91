// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <unicode/datefmt.h>
#include <unicode/numberformatter.h>

#include <map>
#include <memory>
#include <mutex>
#include <utility>

#include "platform/formatting.h"

namespace vaelo {

/// Texts by gettext, numbers and dates by ICU. What is costly to make is made once: lists format every row.
class IcuFormatting : public Formatting {
 public:
  /// Numbers and dates as the environment says; texts in the language that the program was set to.
  IcuFormatting();
  /// `numbers` and `dates` are names of locales, such as "de_DE".
  IcuFormatting(const std::string& numbers, const std::string& dates);

  std::string byteCount(std::uint64_t bytes, ByteCountStyle style, bool withUnit = true) override;
  std::string localizedDate(Date date, DateStyle dateStyle, DateStyle timeStyle) override;
  std::string localizedString(const std::string& key) override;
  std::string localizedCount(const std::string& key, std::int64_t count) override;
  std::string localizedAmount(const std::string& key, double number, const std::string& text) override;
  std::string filled(const std::string& format, const std::vector<std::string>& arguments) override;

 private:
  std::string localizedNumber(double number, int fractionDigits) const;

  icu::number::LocalizedNumberFormatter numbers_[3];  // by the most fraction digits; safe from any thread
  icu::Locale dates_;
  std::mutex mutex_;  // guards dateFormats_ and what is in it
  std::map<std::pair<DateStyle, DateStyle>, std::unique_ptr<icu::DateFormat>> dateFormats_;
};

}  // namespace vaelo
