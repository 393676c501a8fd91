// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/gtk/preview/page_mark.h"

#include <algorithm>

#include "host/decoder/document_words.h"

namespace vaelo {

namespace {
constexpr std::size_t MostPointsOfALine = 2000;
constexpr std::size_t LongestNote = 20'000;  // bytes
}  // namespace

std::string wordsOf(const PageMark& mark) {
  constexpr const char* kinds[] = {"highlight", "ink", "note"};
  std::string words = kinds[static_cast<std::size_t>(mark.kind)] + (" " + std::to_string(mark.page));
  for (const double part : mark.colour) appendNumber(words, part);
  if (mark.kind == PageMark::Kind::Ink) appendNumber(words, mark.width);
  for (const PageRect& line : mark.lines) {
    for (const double edge : {line.left, line.top, line.right, line.bottom}) appendNumber(words, edge);
  }
  for (const auto& point : mark.points) {
    for (const double part : point) appendNumber(words, part);
  }
  return mark.kind == PageMark::Kind::Note ? words + " " + mark.text : words;
}

std::vector<PageMark> inkOf(int page, std::vector<std::array<double, 2>> points, double width) {
  if (points.size() == 1) points.push_back({points[0][0] + 0.1, points[0][1]});
  std::vector<PageMark> marks;
  for (std::size_t begin = 0; begin + 1 < points.size(); begin += MostPointsOfALine - 1) {
    PageMark& mark = marks.emplace_back();
    mark.kind = PageMark::Kind::Ink;
    mark.page = page;
    mark.colour = PageMark::InkColour;
    mark.width = width;
    const std::size_t end = std::min(begin + MostPointsOfALine, points.size());
    mark.points.assign(points.begin() + static_cast<std::ptrdiff_t>(begin),
                       points.begin() + static_cast<std::ptrdiff_t>(end));
  }
  return marks;
}

PageMark noteOf(int page, double x, double y, std::string text) {
  if (text.size() > LongestNote) {
    std::size_t end = LongestNote;
    while (end > 0 && (static_cast<unsigned char>(text[end]) & 0xC0) == 0x80) --end;  // not within a letter
    text.resize(end);
  }
  PageMark mark;
  mark.kind = PageMark::Kind::Note;
  mark.page = page;
  mark.points = {{x, y}};
  mark.text = std::move(text);
  return mark;
}

}  // namespace vaelo
