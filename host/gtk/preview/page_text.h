// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <cstddef>
#include <string>
#include <utility>
#include <vector>

namespace vaelo {

/// A rectangle on a page, in points from its upper left corner.
struct PageRect {
  double left = 0;
  double top = 0;
  double right = 0;
  double bottom = 0;
};

/// The characters of a page in the order in which people read, and where each of them stands. A range is from the first
/// character in it to the first one behind it.
class PageText {
 public:
  using Range = std::pair<std::size_t, std::size_t>;

  /// Of a page without text.
  PageText() = default;
  /// As many characters as there are of both; what is not UTF-8 ends the text.
  PageText(std::vector<PageRect> boxes, const std::string& text);
  std::size_t size() const { return boxes_.size(); }

  /// Before which character a caret would stand that is put here, or size().
  std::size_t caretAt(double x, double y) const;
  /// The word at the place, or near it.
  Range wordAt(double x, double y) const;
  /// Whether there is a character at the place.
  bool isTextAt(double x, double y) const;
  /// Where the range stands: a rectangle for each line.
  std::vector<PageRect> rects(Range range) const;
  std::string text(Range range) const;

 private:
  std::size_t nearest(double x, double y) const;

  std::vector<PageRect> boxes_;
  std::u32string characters_;
};

}  // namespace vaelo
