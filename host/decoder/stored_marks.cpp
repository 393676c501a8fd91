// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/decoder/stored_marks.h"

#include <algorithm>
#include <cmath>

#include "host/decoder/page_height.h"
#include "host/decoder/page_painting.h"

namespace vaelo {

namespace {

constexpr std::size_t LongestText = 30'000;  // bytes, within an answer
constexpr double FarthestReach = 64;         // points

const char* kindOf(PopplerAnnot* annotation) {
  switch (poppler_annot_get_annot_type(annotation)) {
    case POPPLER_ANNOT_HIGHLIGHT:
      return "highlight";
    case POPPLER_ANNOT_INK:
      return "ink";
    case POPPLER_ANNOT_TEXT:
      return "note";
    default:
      return nullptr;
  }
}

bool isSeen(const StoredMark& mark) {
  const int flags = poppler_annot_get_flags(mark.annotation.get());
  return !(flags & (POPPLER_ANNOT_FLAG_INVISIBLE | POPPLER_ANNOT_FLAG_HIDDEN | POPPLER_ANNOT_FLAG_NO_VIEW));
}

bool mayBeChanged(const StoredMark& mark) {
  constexpr int fixed = POPPLER_ANNOT_FLAG_READ_ONLY | POPPLER_ANNOT_FLAG_LOCKED | POPPLER_ANNOT_FLAG_LOCKED_CONTENTS;
  return !(mark.flags & fixed);
}

void setHidden(const StoredMark& mark, bool hidden) {
  const int flags = hidden ? mark.flags | POPPLER_ANNOT_FLAG_HIDDEN : mark.flags;
  poppler_annot_set_flags(mark.annotation.get(), static_cast<PopplerAnnotFlag>(flags));
}

bool isWithin(const PageBox& area, double x, double y, double reach) {
  return x >= static_cast<double>(area[0]) - reach && y >= static_cast<double>(area[1]) - reach &&
         x <= static_cast<double>(area[2]) + reach && y <= static_cast<double>(area[3]) + reach;
}

std::vector<unsigned char> pixelsAround(PopplerPage* page, double x, double y, double reach) {
  const int side = static_cast<int>(std::ceil(2 * reach)) + 1;
  const PageTile tile = {1, static_cast<int>(std::floor(x - reach)), static_cast<int>(std::floor(y - reach)), side, side};
  std::vector<unsigned char> pixels(static_cast<std::size_t>(side) * static_cast<std::size_t>(side) * 4);
  if (!paintPage(page, tile, pixels.data())) pixels.clear();
  return pixels;
}

// The library doesn't tell where a stroke runs, nor turns the corners of what is highlighted with a page. What the mark does
// to the picture tells both.
bool isPaintedAt(PopplerPage* page, const StoredMark& mark, double x, double y, double reach) {
  const std::vector<unsigned char> with = pixelsAround(page, x, y, reach);
  setHidden(mark, true);
  const std::vector<unsigned char> without = pixelsAround(page, x, y, reach);
  setHidden(mark, false);
  return with != without;
}

std::string textOf(const StoredMark& mark) {
  std::string text = takeString(poppler_annot_get_contents(mark.annotation.get()));
  for (std::size_t found = 0; (found = text.find("\r\n", found)) != std::string::npos;) text.erase(found, 1);
  std::replace(text.begin(), text.end(), '\n', '\r');
  if (text.size() <= LongestText) return text;
  std::size_t end = LongestText;
  while (end > 0 && (static_cast<unsigned char>(text[end]) & 0xc0) == 0x80) --end;  // not within a letter
  return text.substr(0, end);
}

}  // namespace

std::vector<StoredMark> storedMarksOf(PopplerPage* page) {
  const double height = heightOf(page);
  std::vector<StoredMark> found;
  GList* annotations = poppler_page_get_annot_mapping(page);
  for (GList* each = annotations; each; each = each->next) {
    const auto* mapping = static_cast<PopplerAnnotMapping*>(each->data);
    found.push_back({GRef<PopplerAnnot>(POPPLER_ANNOT(g_object_ref(mapping->annot))),
                     poppler_annot_get_flags(mapping->annot), flipped(mapping->area, height)});
  }
  poppler_page_free_annot_mapping(annotations);
  return found;
}

std::vector<StoredMark>& StoredMarks::of(PopplerPage* page) {
  const auto [place, isNew] = pages_.try_emplace(poppler_page_get_index(page));
  if (isNew) place->second = storedMarksOf(page);
  return place->second;
}

void StoredMarks::hide(PopplerPage* page, const std::vector<int>& hidden) {
  if (hidden.empty() && !pages_.contains(poppler_page_get_index(page))) return;
  const std::vector<StoredMark>& marks = of(page);
  for (int i = 0; i < std::ssize(marks); ++i) {
    setHidden(marks[static_cast<std::size_t>(i)], std::find(hidden.begin(), hidden.end(), i) != hidden.end());
  }
}

std::string StoredMarks::touched(PopplerPage* page, double x, double y, double reach) {
  reach = std::clamp(reach, 0.0, FarthestReach);
  const std::vector<StoredMark>& marks = of(page);
  for (std::size_t i = marks.size(); i-- > 0;) {
    const StoredMark& mark = marks[i];
    const char* kind = kindOf(mark.annotation.get());
    if (!kind || !isSeen(mark) || !isWithin(mark.area, x, y, reach)) continue;
    const bool isNote = POPPLER_IS_ANNOT_TEXT(mark.annotation.get());
    if (!isNote && !isPaintedAt(page, mark, x, y, reach)) continue;
    return std::to_string(i) + " " + kind + (mayBeChanged(mark) ? " 1 " : " 0 ") + (isNote ? textOf(mark) : "");
  }
  return "";
}

}  // namespace vaelo
