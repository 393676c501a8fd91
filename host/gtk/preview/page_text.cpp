// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/gtk/preview/page_text.h"

#include <glib.h>
#include <unicode/uchar.h>

#include <algorithm>
#include <limits>

namespace vaelo {

namespace {

double outside(double value, double low, double high) { return std::max({low - value, value - high, 0.0}); }

bool isLineEnd(char32_t character) { return character == U'\n' || character == U'\r'; }

// Letters of a word stay together, and so do the signs of a gap or of a row of dots.
int classOf(char32_t character) {
  if (isLineEnd(character)) return 0;
  if (g_unichar_isspace(character)) return 1;
  return g_unichar_isalnum(character) || g_unichar_ismark(character) || character == U'_' || character == U'’' ? 2 : 3;
}

bool isOnLine(const PageRect& line, const PageRect& box) {
  const double shared = std::min(line.bottom, box.bottom) - std::max(line.top, box.top);
  return shared > 0.5 * std::min(line.bottom - line.top, box.bottom - box.top);
}

}  // namespace

PageText::PageText(std::vector<PageRect> boxes, const std::string& text) : boxes_(std::move(boxes)) {
  const char* end = text.data();
  g_utf8_validate(text.data(), static_cast<gssize>(text.size()), &end);
  for (const char* place = text.data(); place < end; place = g_utf8_next_char(place)) {
    characters_ += static_cast<char32_t>(g_utf8_get_char(place));
  }
  const std::size_t both = std::min(boxes_.size(), characters_.size());
  boxes_.resize(both);
  characters_.resize(both);
}

// A line's height counts for more than its end: beside a line one means that line.
std::size_t PageText::nearest(double x, double y) const {
  std::size_t best = 0;
  double least = std::numeric_limits<double>::max();
  for (std::size_t i = 0; i < boxes_.size(); ++i) {
    if (isLineEnd(characters_[i])) continue;
    const double away = outside(x, boxes_[i].left, boxes_[i].right) + 8 * outside(y, boxes_[i].top, boxes_[i].bottom);
    if (away >= least) continue;
    least = away;
    best = i;
  }
  return best;
}

std::size_t PageText::caretAt(double x, double y) const {
  if (boxes_.empty()) return 0;
  const std::size_t character = nearest(x, y);
  const PageRect& box = boxes_[character];
  const bool isRightHalf = x > (box.left + box.right) / 2;
  const UCharDirection direction = u_charDirection(static_cast<UChar32>(characters_[character]));
  const bool readsLeftwards = direction == U_RIGHT_TO_LEFT || direction == U_RIGHT_TO_LEFT_ARABIC;
  return isRightHalf != readsLeftwards ? character + 1 : character;
}

PageText::Range PageText::wordAt(double x, double y) const {
  if (boxes_.empty()) return {0, 0};
  const std::size_t middle = nearest(x, y);
  const int kind = classOf(characters_[middle]);
  std::size_t begin = middle;
  std::size_t end = middle + 1;
  while (begin > 0 && classOf(characters_[begin - 1]) == kind) --begin;
  while (end < characters_.size() && classOf(characters_[end]) == kind) ++end;
  return {begin, end};
}

bool PageText::isTextAt(double x, double y) const {
  if (boxes_.empty()) return false;
  const PageRect& box = boxes_[nearest(x, y)];
  return x >= box.left && x <= box.right && y >= box.top && y <= box.bottom;
}

std::vector<PageRect> PageText::rects(Range range) const {
  std::vector<PageRect> lines;
  bool lineEnded = true;
  for (std::size_t i = range.first; i < std::min(range.second, boxes_.size()); ++i) {
    const PageRect& box = boxes_[i];
    if (isLineEnd(characters_[i])) {
      lineEnded = true;
    } else if (lineEnded || !isOnLine(lines.back(), box)) {
      lines.push_back(box);
      lineEnded = false;
    } else {
      PageRect& line = lines.back();
      line = {std::min(line.left, box.left), std::min(line.top, box.top), std::max(line.right, box.right),
              std::max(line.bottom, box.bottom)};
    }
  }
  return lines;
}

std::string PageText::text(Range range) const {
  std::string found;
  for (std::size_t i = range.first; i < std::min(range.second, characters_.size()); ++i) {
    char letter[6];
    found.append(letter, static_cast<std::size_t>(g_unichar_to_utf8(characters_[i], letter)));
  }
  return found;
}

}  // namespace vaelo
