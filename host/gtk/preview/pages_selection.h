// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <functional>
#include <optional>
#include <string>
#include <vector>

#include "host/gtk/preview/page_text.h"
#include "host/gtk/preview/pages_canvas.h"

namespace vaelo {

/// What of a document's text is selected, between two places on its pages. The places are known before the texts are: what
/// depends on them is worked out when it is asked for. Main thread.
class PagesSelection {
 public:
  enum class Unit { Character, Word, Page };

  /// `textOf` answers null while a page's text is being read.
  explicit PagesSelection(std::function<const PageText*(int page)> textOf) : textOf_(std::move(textOf)) {}

  void begin(const PagePlace& place, Unit unit);
  void extend(const PagePlace& place) { to_ = place; }
  void clear() { isThere_ = false; }
  /// First and last page that may have some of it; first > last when nothing is selected.
  std::pair<int, int> pages() const;
  /// Where it stands on the page: a rectangle for each line.
  std::vector<PageRect> rectsOn(int page) const;
  /// Nothing while a page's text is not read yet.
  std::optional<std::string> text() const;
  bool contains(const PagePlace& place) const;

 private:
  PageText::Range rangeOn(int page, const PageText& text) const;

  std::function<const PageText*(int page)> textOf_;
  bool isThere_ = false;
  Unit unit_ = Unit::Character;
  PagePlace from_;
  PagePlace to_;
};

}  // namespace vaelo
