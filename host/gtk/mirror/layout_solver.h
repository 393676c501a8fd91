// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <vector>

#include "platform/ui/layout_constraint.h"

namespace vaelo {

/// Linear relations between lengths, each with a priority: what has a higher one is never given up for what has a lower one.
/// Relations that can't all hold are broken as little as they can be, in points. Any thread, one at a time.
class LayoutSolver {
 public:
  using Length = int;
  struct Term {
    Length length;
    double factor;
  };
  struct Row {
    std::vector<Term> terms;
    LayoutRelation relation;
    double constant;  ///< points
    float priority;
    double weight = 1;  ///< how much a point counts against those of the same priority
  };

  /// May be negative.
  Length addLength() { return lengths_++; }
  /// The sum of the terms stands in the relation to the constant.
  void add(Row row) { rows_.push_back(std::move(row)); }
  /// The lengths in the order in which they were added; empty when no solution was found.
  std::vector<double> solve() const;

 private:
  int lengths_ = 0;
  std::vector<Row> rows_;
};

}  // namespace vaelo
