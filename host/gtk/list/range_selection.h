// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <cstddef>
#include <string>
#include <vector>

#include "host/gtk/list/folder_model.h"

namespace vaelo {

/// What Shift selects: all from the row that was chosen last without it to the one that is chosen now. With Shift again the
/// range ends elsewhere, and rows that it no longer covers are as they were before. Main thread.
class RangeSelection {
 public:
  /// `model` outlives this.
  explicit RangeSelection(FolderModel& model) : model_(model) {}

  /// A row was chosen without Shift, or the keyboard went to it.
  void begin(std::size_t position);
  /// Selects from there to the row; false when there is no such place.
  bool extendTo(std::size_t position);
  void forget();
  /// Whether the range ends at the row, or begins there and has no end yet.
  bool endsAt(std::size_t position) const { return position < model_.itemCount() && model_.nameAt(position) == end_; }

 private:
  FolderModel& model_;
  std::string begin_;
  std::string end_;
  std::vector<std::size_t> before_;  ///< what else was selected
  std::vector<std::size_t> made_;    ///< what was selected in all after the latest range
  unsigned revision_ = 0;            ///< of the rows that these count
};

}  // namespace vaelo
