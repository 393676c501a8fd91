// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/gtk/fitting_line.h"

#include <algorithm>
#include <utility>
#include <vector>

namespace vaelo {

namespace {

/// Of a label that doesn't fit. With less of it nobody could guess the rest.
constexpr int LeastText = 40;

int naturalSize(GtkWidget* child, GtkOrientation orientation) {
  int natural = 0;
  gtk_widget_measure(child, orientation, -1, nullptr, &natural, nullptr, nullptr);
  return natural;
}

int widthOf(GtkWidget* child) { return naturalSize(child, GTK_ORIENTATION_HORIZONTAL); }

void measureLine(GtkWidget* line, GtkOrientation orientation, int, int* least, int* natural, int*, int*) {
  *least = *natural = 0;
  for (GtkWidget* child = gtk_widget_get_first_child(line); child; child = gtk_widget_get_next_sibling(child)) {
    if (orientation == GTK_ORIENTATION_VERTICAL) {
      *natural = *least = std::max(*natural, naturalSize(child, orientation));
    } else if (gtk_widget_get_next_sibling(child)) {
      *natural += widthOf(child);
    }
  }
}

/// Puts children beside each other, whichever way people read.
class Placing {
 public:
  Placing(GtkWidget* line, int width, int height) : line_(line), width_(width), height_(height) {}
  int left() const { return width_ - used_; }
  void place(GtkWidget* child, int width) {
    const bool fromRight = gtk_widget_get_direction(line_) == GTK_TEXT_DIR_RTL;
    const GtkAllocation at = {fromRight ? width_ - used_ - width : used_, 0, width, height_};
    gtk_widget_set_child_visible(child, TRUE);
    gtk_widget_size_allocate(child, &at, -1);
    used_ += width;
  }

 private:
  GtkWidget* line_;
  int width_;
  int height_;
  int used_ = 0;
};

/// Places what fits; answers the first child that doesn't, and whether the one before it ends in an ellipsis. `reserved` is
/// left for what tells of the rest.
std::pair<std::size_t, bool> placeWhatFits(const std::vector<GtkWidget*>& children, int reserved, Placing& placing) {
  for (std::size_t i = 0; i < children.size(); ++i) {
    const int wanted = widthOf(children[i]);
    const int room = placing.left() - reserved;
    if (!GTK_IS_LABEL(children[i])) {
      const int text = i + 1 < children.size() ? std::min(widthOf(children[i + 1]), LeastText) : 0;
      if (wanted + text > room) return {i, false};
    } else if (wanted > room) {
      if (room < LeastText) return {i, false};
      placing.place(children[i], room);
      return {i + 1, true};
    }
    placing.place(children[i], wanted);
  }
  return {children.size(), false};
}

void allocateLine(GtkWidget* line, int width, int height, int) {
  std::vector<GtkWidget*> children;
  int needed = 0;
  for (GtkWidget* child = gtk_widget_get_first_child(line); child; child = gtk_widget_get_next_sibling(child)) {
    children.push_back(child);
    if (gtk_widget_get_next_sibling(child)) needed += widthOf(child);
  }
  if (children.empty()) return;
  GtkWidget* more = children.back();
  children.pop_back();
  const int reserved = needed > width ? std::min(widthOf(more), width) : 0;
  Placing placing(line, width, height);
  const auto [end, isCut] = placeWhatFits(children, reserved, placing);
  for (std::size_t i = end; i < children.size(); ++i) gtk_widget_set_child_visible(children[i], FALSE);
  if (reserved > 0 && !isCut) {
    placing.place(more, reserved);
  } else {
    gtk_widget_set_child_visible(more, FALSE);
  }
}

}  // namespace

GtkLayoutManager* makeFittingLineLayout() { return gtk_custom_layout_new(nullptr, measureLine, allocateLine); }

}  // namespace vaelo
