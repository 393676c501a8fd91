// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/gtk/preview/pages_layout.h"

#include <algorithm>

namespace vaelo {

void PagesLayout::setCount(int count) {
  sizes_.assign(static_cast<std::size_t>(std::max(count, 0)), PageSize());
  setSizes(0, {});
}

void PagesLayout::setSizes(int from, const std::vector<PageSize>& sizes) {
  const auto begin = std::min(static_cast<std::size_t>(std::max(from, 0)), sizes_.size());
  const std::size_t end = std::min(begin + sizes.size(), sizes_.size());
  std::copy_n(sizes.begin(), end - begin, sizes_.begin() + static_cast<std::ptrdiff_t>(begin));
  if (end > 0) std::fill(sizes_.begin() + static_cast<std::ptrdiff_t>(end), sizes_.end(), sizes_[end - 1]);
  tops_.assign(1, 0);
  widest_ = 0;
  for (const PageSize& size : sizes_) {
    tops_.push_back(tops_.back() + size.height);
    widest_ = std::max(widest_, size.width);
  }
}

double PagesLayout::height(double zoom) const { return tops_.back() * zoom + Gap * (count() + 1); }

PageArea PagesLayout::area(int page, double zoom, double available) const {
  const PageSize& shown = size(page);
  const double column = std::max(available, width(zoom));
  return {(column - shown.width * zoom) / 2, tops_[static_cast<std::size_t>(page)] * zoom + Gap * (page + 1),
          shown.width * zoom, shown.height * zoom};
}

int PagesLayout::pageAt(double y, double zoom) const {
  int low = 0;
  int high = std::max(count() - 1, 0);
  while (low < high) {
    const int middle = (low + high + 1) / 2;
    tops_[static_cast<std::size_t>(middle)] * zoom + Gap*(middle + 1) <= y ? low = middle : high = middle - 1;
  }
  return low;
}

}  // namespace vaelo
