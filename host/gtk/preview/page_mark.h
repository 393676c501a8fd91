// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <array>
#include <string>
#include <vector>

#include "host/gtk/preview/page_text.h"

namespace vaelo {

/// A mark that a person makes on a page. Places are points from the page's upper left corner.
struct PageMark {
  enum class Kind { Highlight, Ink, Note };
  static constexpr double NoteSide = 24;                               ///< of a note's icon, points
  static constexpr std::array<double, 3> InkColour = {0.8, 0.1, 0.1};  ///< red, green, blue, 0 to 1

  Kind kind = Kind::Highlight;
  int page = 0;
  std::array<double, 3> colour = {1, 0.85, 0.2};  ///< red, green, blue, 0 to 1
  double width = 0;                               ///< of ink, points
  std::vector<PageRect> lines;                    ///< what is highlighted
  std::vector<std::array<double, 2>> points;      ///< of ink; a note's upper left corner
  std::string text;                               ///< of a note
};

/// The request by which the decoder takes the mark, without its first word.
std::string wordsOf(const PageMark& mark);
/// A line of at least one point that was drawn, in pieces short enough for a request each; a dot is a very short line.
std::vector<PageMark> inkOf(int page, std::vector<std::array<double, 2>> points, double width);
/// Cuts the text of a note to what a request holds.
PageMark noteOf(int page, double x, double y, std::string text);

}  // namespace vaelo
