// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <cstddef>
#include <string>
#include <string_view>

namespace vaelo {

/// Prepares lines for a text view, which lays out a line as a whole and keeps a record for each: every end of a line becomes
/// a newline, a line that is too long goes on in the next, and there is a most of lines.
class TextLines {
 public:
  TextLines(std::size_t mostCharacters, std::size_t mostLines) : mostCharacters_(mostCharacters), mostLines_(mostLines) {}

  /// The next piece of a text; valid UTF-8 that ends with a whole character.
  std::string arrange(std::string_view text);
  bool brokeLines() const { return brokeLines_; }
  /// In characters, of the lines so far.
  std::size_t longestLine() const { return longest_; }
  /// There are as many lines as there may be; the rest was left out.
  bool isFull() const { return lines_ >= mostLines_; }

 private:
  void endLine(std::string& arranged);

  std::size_t mostCharacters_;
  std::size_t mostLines_;
  std::size_t lines_ = 0;
  std::size_t characters_ = 0;  // of the line
  std::size_t longest_ = 0;
  bool afterReturn_ = false;
  bool brokeLines_ = false;
};

}  // namespace vaelo
