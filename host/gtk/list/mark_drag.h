// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <gtk/gtk.h>

#include <string>
#include <vector>

#include "host/gtk/list/folder_model.h"
#include "host/gtk/list/folder_row.h"

namespace vaelo {

/// Lets a finger that goes down the check marks of a list set or clear all that it passes; elsewhere it scrolls. Near the
/// edges the list moves on below it. Main thread.
class MarkDrag {
 public:
  /// `context` is that of the rows of `model` in `scroller`; all outlive this.
  MarkDrag(GtkWidget* scroller, RowContext& context, FolderModel& model);
  ~MarkDrag();
  MarkDrag(const MarkDrag&) = delete;
  MarkDrag& operator=(const MarkDrag&) = delete;

 private:
  void began(double x, double y);
  void moved(double y);
  void ended();
  /// Takes the rows up to the one at that height in.
  void reach(double y);
  /// For a frame.
  void scroll();
  FolderItem* itemAt(double y) const;

  GtkWidget* scroller_;
  RowContext& context_;
  FolderModel& model_;
  GtkGesture* drag_;
  std::string first_;  ///< the item that the finger touched, empty for none
  double x_ = 0;       ///< of the check marks
  double y_ = 0;       ///< of the finger
  bool dragging_ = false;
  bool sets_ = false;                ///< else it clears
  std::vector<std::size_t> before_;  ///< what was selected then
  unsigned revision_ = 0;            ///< of the rows that `before_` counts
  guint tick_ = 0;
};

}  // namespace vaelo
