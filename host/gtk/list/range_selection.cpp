// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/gtk/list/range_selection.h"

#include <algorithm>
#include <iterator>
#include <numeric>

namespace vaelo {

void RangeSelection::begin(std::size_t position) {
  begin_ = end_ = model_.nameAt(position);
  made_.clear();
}

void RangeSelection::forget() {
  begin_.clear();
  end_.clear();
  made_.clear();
}

bool RangeSelection::extendTo(std::size_t position) {
  const auto first = model_.indexOf(begin_);
  if (!first) return false;
  const std::vector<std::size_t> selected = model_.selectedRows();
  // Whoever changed the selection otherwise meanwhile means what it was then to stay.
  if (made_.empty() || revision_ != model_.revision() || selected != made_) before_ = selected;
  std::vector<std::size_t> range(std::max(*first, position) - std::min(*first, position) + 1);
  std::iota(range.begin(), range.end(), std::min(*first, position));
  made_.clear();
  std::set_union(before_.begin(), before_.end(), range.begin(), range.end(), std::back_inserter(made_));
  revision_ = model_.revision();
  end_ = model_.nameAt(position);
  model_.selectRows(made_);
  return true;
}

}  // namespace vaelo
