// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/gtk/preview/pages_pointer.h"

#include <algorithm>
#include <cmath>

namespace vaelo {

namespace {
constexpr double FastestScroll = 24;  // pixels a frame
constexpr double StillInPlace = 2;    // pixels, below which a drag may yet become a pinch
}  // namespace

PagesPointer::PagesPointer(PagesCanvas& canvas, Events events)
    : canvas_(canvas),
      events_(std::move(events)),
      drag_(gtk_gesture_drag_new()),
      longPress_(gtk_gesture_long_press_new()),
      secondary_(gtk_gesture_click_new()),
      click_(gtk_gesture_click_new()) {
  gtk_gesture_single_set_touch_only(GTK_GESTURE_SINGLE(longPress_), TRUE);
  gtk_gesture_single_set_button(GTK_GESTURE_SINGLE(secondary_), GDK_BUTTON_SECONDARY);
  g_signal_connect(drag_, "drag-begin",
                   G_CALLBACK(+[](GtkGestureDrag*, double x, double y, PagesPointer* self) { self->began(x, y); }), this);
  g_signal_connect(drag_, "drag-update", G_CALLBACK(+[](GtkGestureDrag* drag, double x, double y, PagesPointer* self) {
                     double startX = 0;
                     double startY = 0;
                     gtk_gesture_drag_get_start_point(drag, &startX, &startY);
                     if (std::hypot(x, y) > StillInPlace && self->dragging_) {
                       gtk_gesture_set_state(self->drag_, GTK_EVENT_SEQUENCE_CLAIMED);
                     }
                     self->moved(startX + x, startY + y);
                   }),
                   this);
  g_signal_connect_swapped(drag_, "drag-end", G_CALLBACK(+[](PagesPointer* self) { self->ended(false); }), this);
  g_signal_connect_swapped(drag_, "cancel", G_CALLBACK(+[](PagesPointer* self) { self->ended(true); }), this);
  g_signal_connect(
      longPress_, "pressed",
      G_CALLBACK(+[](GtkGestureLongPress*, double x, double y, PagesPointer* self) { self->pressedLong(x, y); }), this);
  g_signal_connect(
      secondary_, "pressed",
      G_CALLBACK(+[](GtkGestureClick*, int, double x, double y, PagesPointer* self) { self->events_.menu(x, y); }), this);
  g_signal_connect(click_, "released",
                   G_CALLBACK(+[](GtkGestureClick*, int presses, double x, double y, PagesPointer* self) {
                     if (presses == 1) self->events_.click(x, y);
                   }),
                   this);
  gtk_gesture_group(longPress_, drag_);
  for (GtkGesture* gesture : {drag_, longPress_, secondary_, click_}) {
    gtk_widget_add_controller(canvas_.widget(), GTK_EVENT_CONTROLLER(gesture));
  }
}

PagesPointer::~PagesPointer() {
  stopScrolling();
  dragging_ = false;
  for (GtkGesture* gesture : {drag_, longPress_, secondary_, click_}) {
    g_signal_handlers_disconnect_by_data(gesture, this);
    gtk_widget_remove_controller(canvas_.widget(), GTK_EVENT_CONTROLLER(gesture));
  }
}

// By the event, since its device may be the pointer that a finger moves too.
bool PagesPointer::isFinger() const {
  GdkEvent* event = gtk_event_controller_get_current_event(GTK_EVENT_CONTROLLER(drag_));
  return event && gdk_event_get_event_type(event) == GDK_TOUCH_BEGIN;
}

int PagesPointer::countPresses(double x, double y) {
  const guint32 now = gtk_event_controller_get_current_event_time(GTK_EVENT_CONTROLLER(drag_));
  int time = 0;
  int distance = 0;
  g_object_get(gtk_widget_get_settings(canvas_.widget()), "gtk-double-click-time", &time, "gtk-double-click-distance",
               &distance, nullptr);
  const bool again =
      presses_ > 0 && now - pressedAt_ <= static_cast<guint32>(time) && std::hypot(x - pressedX_, y - pressedY_) <= distance;
  presses_ = again ? presses_ + 1 : 1;
  pressedAt_ = now;
  pressedX_ = x;
  pressedY_ = y;
  return presses_;
}

void PagesPointer::began(double x, double y) {
  gtk_widget_grab_focus(canvas_.widget());
  dragging_ = events_.wantsDrag(isFinger());
  if (dragging_) events_.begin(x, y, countPresses(x, y));
}

void PagesPointer::moved(double x, double y) {
  if (!dragging_) return;
  x_ = x;
  y_ = y;
  events_.move(x, y);
  const bool isBeyond = events_.scrollsAtEdges() && (y < 0 || y > canvas_.height());
  if (!isBeyond) return stopScrolling();
  if (tick_) return;
  tick_ = gtk_widget_add_tick_callback(
      canvas_.widget(),
      +[](GtkWidget*, GdkFrameClock*, gpointer self) -> gboolean { return static_cast<PagesPointer*>(self)->scroll(); },
      this, nullptr);
}

gboolean PagesPointer::scroll() {
  const double beyond = y_ < 0 ? y_ : y_ - canvas_.height();
  canvas_.scrollBy(0, std::clamp(beyond / 2, -FastestScroll, FastestScroll));
  events_.move(x_, y_);
  return G_SOURCE_CONTINUE;
}

void PagesPointer::stopScrolling() {
  if (tick_) gtk_widget_remove_tick_callback(canvas_.widget(), tick_);
  tick_ = 0;
}

void PagesPointer::ended(bool cancelled) {
  stopScrolling();
  if (!dragging_) return;
  dragging_ = false;
  events_.end(cancelled);
}

void PagesPointer::pressedLong(double x, double y) {
  if (dragging_) return;
  gtk_gesture_set_state(longPress_, GTK_EVENT_SEQUENCE_CLAIMED);
  dragging_ = true;
  events_.longPress(x, y);
}

}  // namespace vaelo
