// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <gtk/gtk.h>

#include <functional>
#include <string>
#include <vector>

#include "host/gtk/preview/pages_layout.h"

namespace vaelo {

/// What screen readers find of pages that are only drawn: for each that shows, a part that nobody sees, with the page's
/// place, number and text. Main thread.
class PageParts {
 public:
  explicit PageParts(GtkWidget* area) : area_(area) {}
  ~PageParts();
  PageParts(const PageParts&) = delete;
  PageParts& operator=(const PageParts&) = delete;

  /// From now on these of `count` pages show.
  void show(int first, int last, int count);
  /// What is written on a page, where it shows.
  void describe(int page, const std::string& text);
  /// Within the area's own allocation.
  void allocate(const std::function<PageArea(int page)>& areaOf) const;

 private:
  GtkWidget* area_;
  int first_ = 0;
  int count_ = 0;
  std::size_t shown_ = 0;
  std::vector<GtkWidget*> parts_;  // as many as ever showed at once; those behind `shown_` are hidden
};

}  // namespace vaelo
