// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/gtk/list/mark_drag.h"

#include <algorithm>
#include <cmath>
#include <iterator>
#include <numeric>
#include <utility>

namespace vaelo {
namespace {

constexpr double DecidesAfter = 6;  // before the list takes the finger for a scroll
constexpr double Edge = 48;
constexpr double FastestPixelsAFrame = 12;

}  // namespace

MarkDrag::MarkDrag(GtkWidget* scroller, RowContext& context, FolderModel& model)
    : scroller_(scroller), context_(context), model_(model), drag_(gtk_gesture_drag_new()) {
  gtk_gesture_single_set_touch_only(GTK_GESTURE_SINGLE(drag_), TRUE);
  gtk_event_controller_set_propagation_phase(GTK_EVENT_CONTROLLER(drag_), GTK_PHASE_CAPTURE);
  g_signal_connect_swapped(drag_, "drag-begin", G_CALLBACK(+[](MarkDrag* self, double x, double y) { self->began(x, y); }),
                           this);
  g_signal_connect_swapped(drag_, "drag-update", G_CALLBACK(+[](MarkDrag* self, double, double y) { self->moved(y); }),
                           this);
  g_signal_connect_swapped(drag_, "drag-end", G_CALLBACK(+[](MarkDrag* self, double, double) { self->ended(); }), this);
  gtk_widget_add_controller(scroller_, GTK_EVENT_CONTROLLER(drag_));
}

MarkDrag::~MarkDrag() {
  ended();
  g_signal_handlers_disconnect_by_data(drag_, this);
  gtk_widget_remove_controller(scroller_, GTK_EVENT_CONTROLLER(drag_));
}

FolderItem* MarkDrag::itemAt(double y) const {
  GtkWidget* row = folderRowIn(gtk_widget_pick(scroller_, x_, y, GTK_PICK_DEFAULT));
  GObject* item = row ? folderRowItem(row) : nullptr;
  return item ? &folderItemOf(item) : nullptr;
}

void MarkDrag::began(double x, double y) {
  first_.clear();
  dragging_ = false;
  if (!context_.editing) return;
  x_ = x;
  const FolderItem* item = itemAt(y);
  double inRow = 0;
  if (!item || !item->row || !gtk_widget_translate_coordinates(scroller_, item->row, x, y, &inRow, nullptr)) return;
  if (folderRowMarkIsAt(item->row, inRow)) first_ = item->name;
}

void MarkDrag::moved(double y) {
  if (first_.empty()) return;
  if (!dragging_) {
    if (std::abs(y) < DecidesAfter) return;
    const auto first = model_.indexOf(first_);
    if (!first) return first_.clear();
    gtk_gesture_set_state(drag_, GTK_EVENT_SEQUENCE_CLAIMED);
    dragging_ = true;
    sets_ = !model_.isSelected(*first);
    before_ = model_.selectedRows();
    revision_ = model_.revision();
    tick_ = gtk_widget_add_tick_callback(
        scroller_,
        [](GtkWidget*, GdkFrameClock*, gpointer self) -> gboolean {
          static_cast<MarkDrag*>(self)->scroll();
          return G_SOURCE_CONTINUE;
        },
        this, nullptr);
  }
  double beginY = 0;
  gtk_gesture_drag_get_start_point(GTK_GESTURE_DRAG(drag_), nullptr, &beginY);
  y_ = beginY + y;
  reach(y_);
}

void MarkDrag::reach(double y) {
  const FolderItem* item = itemAt(std::clamp(y, 1.0, std::max(1.0, gtk_widget_get_height(scroller_) - 2.0)));
  const auto first = model_.indexOf(first_);
  // Rows that come or go meanwhile end it: what was counted stands elsewhere.
  if (revision_ != model_.revision() || !first) return ended();
  const auto last = item ? model_.indexOf(item->name) : std::nullopt;
  if (!last) return;
  std::vector<std::size_t> passed(std::max(*first, *last) - std::min(*first, *last) + 1);
  std::iota(passed.begin(), passed.end(), std::min(*first, *last));
  std::vector<std::size_t> selected;
  if (sets_) {
    std::set_union(before_.begin(), before_.end(), passed.begin(), passed.end(), std::back_inserter(selected));
  } else {
    std::set_difference(before_.begin(), before_.end(), passed.begin(), passed.end(), std::back_inserter(selected));
  }
  if (selected != model_.selectedRows()) model_.selectRows(selected);
}

void MarkDrag::scroll() {
  const double height = gtk_widget_get_height(scroller_);
  const double beyond = y_ < Edge ? y_ - Edge : std::max(0.0, y_ - (height - Edge));
  if (beyond == 0) return;
  GtkAdjustment* adjustment = gtk_scrolled_window_get_vadjustment(GTK_SCROLLED_WINDOW(scroller_));
  const double before = gtk_adjustment_get_value(adjustment);
  gtk_adjustment_set_value(adjustment, before + FastestPixelsAFrame * std::clamp(beyond / Edge, -1.0, 1.0));
  if (gtk_adjustment_get_value(adjustment) != before) reach(y_);
}

void MarkDrag::ended() {
  if (guint tick = std::exchange(tick_, 0)) gtk_widget_remove_tick_callback(scroller_, tick);
  dragging_ = false;
  first_.clear();
  before_.clear();
}

}  // namespace vaelo
