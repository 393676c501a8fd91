// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <cstddef>
#include <vector>

namespace vaelo {

/// In points.
struct PageSize {
  double width = 595;
  double height = 842;
};

/// A rectangle in pixels of the window.
struct PageArea {
  double x = 0;
  double y = 0;
  double width = 0;
  double height = 0;
};

/// Where the pages of a document stand: one below the other, centred. Every question takes at most logarithmic time in the
/// number of pages, so that a document of any length scrolls like a short one.
class PagesLayout {
 public:
  static constexpr double Gap = 12;  ///< around and between pages, pixels

  /// As many pages of a usual size.
  void setCount(int count);
  /// The sizes of some pages; those behind them are thought to be like the last one.
  void setSizes(int from, const std::vector<PageSize>& sizes);
  int count() const { return static_cast<int>(sizes_.size()); }
  const PageSize& size(int page) const { return sizes_[static_cast<std::size_t>(page)]; }
  double widest() const { return widest_; }

  double width(double zoom) const { return widest_ * zoom + 2 * Gap; }
  double height(double zoom) const;
  /// The page in a column that is `available` pixels wide, or as wide as width().
  PageArea area(int page, double zoom, double available) const;
  /// The page at this height, or the last one that begins before it; 0 where there are none.
  int pageAt(double y, double zoom) const;

 private:
  std::vector<PageSize> sizes_;
  std::vector<double> tops_ = {0};  // of each page, and of one more, in points without gaps
  double widest_ = 595;
};

}  // namespace vaelo
