// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/gtk/preview/page_mark.h"

#include <glib.h>

#include <algorithm>
#include <cmath>
#include <iterator>
#include <string_view>

#include "host/decoder/document_words.h"

namespace vaelo {

namespace {
constexpr std::size_t MostPointsOfALine = 2000;
constexpr std::array<std::string_view, 3> Kinds = {"highlight", "ink", "note"};

double distance(const std::array<double, 2>& from, const std::array<double, 2>& to, double x, double y) {
  const double across = to[0] - from[0];
  const double down = to[1] - from[1];
  const double length = across * across + down * down;
  const double part = length > 0 ? std::clamp(((x - from[0]) * across + (y - from[1]) * down) / length, 0.0, 1.0) : 0;
  return std::hypot(from[0] + part * across - x, from[1] + part * down - y);
}

bool isWithin(const PageRect& rect, double x, double y, double reach) {
  return x >= rect.left - reach && x <= rect.right + reach && y >= rect.top - reach && y <= rect.bottom + reach;
}
}  // namespace

std::string wordsOf(const PageMark& mark) {
  std::string words = std::string(Kinds[static_cast<std::size_t>(mark.kind)]) + (" " + std::to_string(mark.page));
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

std::string noteText(std::string text) {
  if (text.size() <= PageMark::LongestNote) return text;
  std::size_t end = PageMark::LongestNote;
  while (end > 0 && (static_cast<unsigned char>(text[end]) & 0xC0) == 0x80) --end;  // not within a letter
  text.resize(end);
  return text;
}

PageMark noteOf(int page, double x, double y, std::string text) {
  PageMark mark;
  mark.kind = PageMark::Kind::Note;
  mark.page = page;
  mark.points = {{x, y}};
  mark.text = noteText(std::move(text));
  return mark;
}

std::optional<TouchedMark> touchedMarkIn(int page, const std::string& words) {
  std::string_view rest = words;
  TouchedMark touched;
  PageMark& mark = touched.mark;
  mark.page = page;
  if (!nextNumber(rest, mark.stored) || mark.stored < 0) return std::nullopt;
  const std::string_view kind = nextWord(rest);
  const auto* const found = std::find(std::begin(Kinds), std::end(Kinds), kind);
  if (found == std::end(Kinds)) return std::nullopt;
  mark.kind = static_cast<PageMark::Kind>(found - std::begin(Kinds));
  touched.mayBeChanged = nextWord(rest) == "1";
  mark.text = rest;
  std::replace(mark.text.begin(), mark.text.end(), '\r', '\n');
  if (!g_utf8_validate(mark.text.c_str(), static_cast<gssize>(mark.text.size()), nullptr)) return std::nullopt;
  return touched;
}

bool isMarkAt(const PageMark& mark, double x, double y, double reach) {
  if (mark.kind == PageMark::Kind::Highlight) {
    return std::any_of(mark.lines.begin(), mark.lines.end(),
                       [&](const PageRect& line) { return isWithin(line, x, y, reach); });
  }
  if (mark.points.empty()) return false;
  if (mark.kind == PageMark::Kind::Note) {
    const auto& [left, top] = mark.points.front();
    return isWithin({left, top, left + PageMark::NoteSide, top + PageMark::NoteSide}, x, y, reach);
  }
  for (std::size_t i = 0; i + 1 < mark.points.size(); ++i) {
    if (distance(mark.points[i], mark.points[i + 1], x, y) <= reach + mark.width / 2) return true;
  }
  return false;
}

}  // namespace vaelo
