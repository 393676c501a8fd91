// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <array>
#include <optional>
#include <string>
#include <vector>

#include "host/gtk/preview/page_text.h"

namespace vaelo {

/// A mark that a person makes on a page. Places are points from the page's upper left corner.
struct PageMark {
  enum class Kind { Highlight, Ink, Note };
  static constexpr double NoteSide = 24;                               ///< of a note's icon, points
  static constexpr std::array<double, 3> InkColour = {0.8, 0.1, 0.1};  ///< red, green, blue, 0 to 1
  static constexpr std::size_t LongestNote = 20'000;                   ///< bytes, that a request holds

  Kind kind = Kind::Highlight;
  int page = 0;
  std::array<double, 3> colour = {1, 0.85, 0.2};  ///< red, green, blue, 0 to 1
  double width = 0;                               ///< of ink, points
  std::vector<PageRect> lines;                    ///< what is highlighted
  std::vector<std::array<double, 2>> points;      ///< of ink; a note's upper left corner
  std::string text;                               ///< of a note
  int number = 0;                                 ///< of a mark that was made while the document is shown, from 1
  int stored = -1;                                ///< of one that the file has: its place among those of its page

  bool isSame(const PageMark& other) const { return page == other.page && number == other.number && stored == other.stored; }
};

/// A mark of the file, as the decoder tells that it was touched; nothing when it tells none. Its points are not known.
struct TouchedMark {
  PageMark mark;
  bool mayBeChanged = false;
};
std::optional<TouchedMark> touchedMarkIn(int page, const std::string& words);

/// The request by which the decoder takes the mark, without its first word.
std::string wordsOf(const PageMark& mark);
/// A line of at least one point that was drawn, in pieces short enough for a request each; a dot is a very short line.
std::vector<PageMark> inkOf(int page, std::vector<std::array<double, 2>> points, double width);
PageMark noteOf(int page, double x, double y, std::string text);
/// The text of a note, cut to what a request holds.
std::string noteText(std::string text);
/// Whether the mark is within so many points of the place, which is on its page. Not for one of the file.
bool isMarkAt(const PageMark& mark, double x, double y, double reach);

}  // namespace vaelo
