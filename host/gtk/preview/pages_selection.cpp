// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/gtk/preview/pages_selection.h"

#include <algorithm>

namespace vaelo {

void PagesSelection::begin(const PagePlace& place, Unit unit) {
  isThere_ = true;
  unit_ = unit;
  from_ = to_ = place;
}

std::pair<int, int> PagesSelection::pages() const {
  if (!isThere_) return {0, -1};
  return std::minmax({from_.page, to_.page});
}

PageText::Range PagesSelection::rangeOn(int page, const PageText& text) const {
  const auto [first, last] = pages();
  if (page < first || page > last) return {0, 0};
  if (unit_ == Unit::Page) return {0, text.size()};
  const auto at = [&](const PagePlace& place) -> PageText::Range {
    if (unit_ == Unit::Word) return text.wordAt(place.x, place.y);
    const std::size_t caret = text.caretAt(place.x, place.y);
    return {caret, caret};
  };
  if (first == last) {
    const PageText::Range one = at(from_);
    const PageText::Range other = at(to_);
    return {std::min(one.first, other.first), std::max(one.second, other.second)};
  }
  if (page == first) return {at(from_.page == first ? from_ : to_).first, text.size()};
  if (page == last) return {0, at(to_.page == last ? to_ : from_).second};
  return {0, text.size()};
}

std::vector<PageRect> PagesSelection::rectsOn(int page) const {
  const auto [first, last] = pages();
  if (page < first || page > last) return {};
  const PageText* text = textOf_(page);
  return text ? text->rects(rangeOn(page, *text)) : std::vector<PageRect>();
}

std::optional<std::string> PagesSelection::text() const {
  const auto [first, last] = pages();
  std::string all;
  bool isWhole = true;
  for (int page = first; page <= last; ++page) {
    const PageText* text = textOf_(page);
    isWhole = isWhole && text;
    if (!text) continue;
    if (!all.empty() && all.back() != '\n') all += '\n';
    all += text->text(rangeOn(page, *text));
  }
  return isWhole ? std::optional(all) : std::nullopt;
}

bool PagesSelection::contains(const PagePlace& place) const {
  const std::vector<PageRect> rects = rectsOn(place.page);
  return std::any_of(rects.begin(), rects.end(), [&](const PageRect& rect) {
    return place.x >= rect.left && place.x <= rect.right && place.y >= rect.top && place.y <= rect.bottom;
  });
}

}  // namespace vaelo
