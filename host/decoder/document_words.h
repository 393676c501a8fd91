// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <array>
#include <charconv>
#include <cmath>
#include <string>
#include <string_view>

namespace vaelo {

/// The next word of a request, which it leaves without it.
inline std::string_view nextWord(std::string_view& words) {
  const std::size_t end = std::min(words.find(' '), words.size());
  const std::string_view word = words.substr(0, end);
  words.remove_prefix(std::min(end + 1, words.size()));
  return word;
}

/// The next word as a number; false when it isn't a finite one.
template <typename Number>
bool nextNumber(std::string_view& words, Number& number) {
  const std::string_view word = nextWord(words);
  const auto [end, problem] = std::from_chars(word.data(), word.data() + word.size(), number);
  return problem == std::errc() && end == word.data() + word.size() && std::isfinite(static_cast<double>(number));
}

/// Appends a blank and the number with two digits behind the point, in every locale.
inline void appendNumber(std::string& words, double number) {
  std::array<char, 64> digits = {};
  if (!(std::abs(number) < 1e9)) number = 0;
  const auto [end, problem] = std::to_chars(digits.begin(), digits.end(), number, std::chars_format::fixed, 2);
  words += ' ';
  words.append(digits.data(), end);
}

}  // namespace vaelo
