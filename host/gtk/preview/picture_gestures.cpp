// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/gtk/preview/picture_gestures.h"

#include <algorithm>
#include <cmath>
#include <utility>

namespace vaelo {

namespace {

constexpr double KeyStep = 1.4;
constexpr double WheelStep = 1.25;
constexpr double TouchpadStep = 1.01;  // a logical pixel of scrolling
constexpr double ArrowStep = 60;
constexpr double WheelPan = 60;  // logical pixels a click of the wheel
constexpr guint ZoomTime = 160;  // milliseconds
constexpr double Friction = 4;   // how much of its speed a flick loses in a second, as an exponent
constexpr double Slowest = 20;   // logical pixels a second

bool isZoomedOut(const PictureViewport& viewport) { return viewport.isFitting(); }

}  // namespace

PictureGestures::PictureGestures(PictureCanvas& canvas) : canvas_(canvas) {
  AdwAnimationTarget* target = adw_callback_animation_target_new(
      +[](double progress, gpointer self) { static_cast<PictureGestures*>(self)->zoomStep(progress); }, this, nullptr);
  animation_ = adw_timed_animation_new(canvas.widget(), 0, 1, ZoomTime, target);
  adw_timed_animation_set_easing(ADW_TIMED_ANIMATION(animation_), ADW_EASE_OUT_CUBIC);
  addTouch();
  addPointer();
}

PictureGestures::~PictureGestures() {
  stopMoving();
  for (GtkEventController* controller : controllers_) {
    g_signal_handlers_disconnect_by_data(controller, this);
    gtk_widget_remove_controller(canvas_.widget(), controller);
  }
  g_object_unref(animation_);
}

void PictureGestures::add(GtkEventController* controller) {
  gtk_widget_add_controller(canvas_.widget(), controller);
  controllers_.push_back(controller);
}

void PictureGestures::addTouch() {
  GtkGesture* pinch = gtk_gesture_zoom_new();
  g_signal_connect(pinch, "begin", G_CALLBACK(+[](GtkGesture* gesture, GdkEventSequence*, PictureGestures* self) {
                     self->stopMoving();
                     self->pinchedFrom_ = self->canvas_.viewport().scale();
                     gtk_gesture_get_bounding_box_center(gesture, &self->pinchedAt_.x, &self->pinchedAt_.y);
                     gtk_gesture_set_state(gesture, GTK_EVENT_SEQUENCE_CLAIMED);
                   }),
                   this);
  g_signal_connect(
      pinch, "scale-changed",
      G_CALLBACK(+[](GtkGesture* gesture, double change, PictureGestures* self) { self->pinched(gesture, change); }), this);
  add(GTK_EVENT_CONTROLLER(pinch));

  GtkGesture* drag = gtk_gesture_drag_new();
  g_signal_connect(drag, "drag-begin", G_CALLBACK(+[](GtkGestureDrag*, double, double, PictureGestures* self) {
                     self->stopMoving();
                     self->draggedTo_ = PictureViewport::Point();
                   }),
                   this);
  g_signal_connect(drag, "drag-update", G_CALLBACK(+[](GtkGesture* gesture, double x, double y, PictureGestures* self) {
                     if (self->dragged(x, y)) gtk_gesture_set_state(gesture, GTK_EVENT_SEQUENCE_CLAIMED);
                   }),
                   this);
  g_signal_connect(drag, "drag-end", G_CALLBACK(+[](GtkGestureDrag*, double, double, PictureGestures* self) {
                     self->showCursor(self->canvas_.viewport().canPan() ? "grab" : nullptr);
                   }),
                   this);
  add(GTK_EVENT_CONTROLLER(drag));

  GtkGesture* swipe = gtk_gesture_swipe_new();
  gtk_gesture_single_set_touch_only(GTK_GESTURE_SINGLE(swipe), TRUE);
  g_signal_connect(swipe, "swipe",
                   G_CALLBACK(+[](GtkGestureSwipe*, double x, double y, PictureGestures* self) { self->flick(x, y); }),
                   this);
  add(GTK_EVENT_CONTROLLER(swipe));
  gtk_gesture_group(swipe, drag);

  GtkGesture* tap = gtk_gesture_click_new();
  g_signal_connect(tap, "released", G_CALLBACK(+[](GtkGestureClick*, int count, double x, double y, PictureGestures* self) {
                     gtk_widget_grab_focus(self->canvas_.widget());
                     if (self->touched_) self->touched_();
                     if (count == 2) self->doubleTapped(PictureViewport::Point{x, y});
                   }),
                   this);
  add(GTK_EVENT_CONTROLLER(tap));
}

void PictureGestures::addPointer() {
  GtkEventController* motion = gtk_event_controller_motion_new();
  g_signal_connect(motion, "motion", G_CALLBACK(+[](GtkEventControllerMotion*, double x, double y, PictureGestures* self) {
                     if (x == self->pointer_.x && y == self->pointer_.y) return;
                     self->pointer_.x = x;
                     self->pointer_.y = y;
                     if (self->touched_) self->touched_();
                   }),
                   this);
  add(motion);

  GtkEventController* scroll = gtk_event_controller_scroll_new(static_cast<GtkEventControllerScrollFlags>(
      GTK_EVENT_CONTROLLER_SCROLL_BOTH_AXES | GTK_EVENT_CONTROLLER_SCROLL_KINETIC));
  g_signal_connect(scroll, "scroll",
                   G_CALLBACK(+[](GtkEventControllerScroll* controller, double dx, double dy,
                                  PictureGestures* self) -> gboolean { return self->scrolled(controller, dx, dy); }),
                   this);
  g_signal_connect(scroll, "decelerate",
                   G_CALLBACK(+[](GtkEventController* controller, double x, double y, PictureGestures* self) {
                     if (!(gtk_event_controller_get_current_event_state(controller) & GDK_CONTROL_MASK)) self->flick(-x, -y);
                   }),
                   this);
  add(scroll);

  GtkEventController* keys = gtk_event_controller_key_new();
  g_signal_connect(keys, "key-pressed",
                   G_CALLBACK(+[](GtkEventControllerKey*, guint key, guint, GdkModifierType state,
                                  PictureGestures* self) -> gboolean { return self->pressed(key, state); }),
                   this);
  add(keys);
}

PictureViewport::Point PictureGestures::middle() const {
  const PictureViewport::Size window = canvas_.viewport().window();
  return {window.width / 2, window.height / 2};
}

void PictureGestures::zoomIn() { zoomBy(KeyStep, middle()); }
void PictureGestures::zoomOut() { zoomBy(1 / KeyStep, middle()); }
void PictureGestures::showWhole() { zoomSmoothly(canvas_.viewport().fitScale(), middle()); }

// Steps that come quickly add up, so it starts from where the one before it is going.
void PictureGestures::zoomBy(double factor, PictureViewport::Point at) {
  const bool isGoing = adw_animation_get_state(animation_) == ADW_ANIMATION_PLAYING;
  zoomSmoothly((isGoing ? zoomedTo_ : canvas_.viewport().scale()) * factor, at);
}

void PictureGestures::zoomSmoothly(double scale, PictureViewport::Point at) {
  stopMoving();
  const PictureViewport& viewport = canvas_.viewport();
  zoomedFrom_ = viewport.scale();
  zoomedTo_ = std::clamp(scale, viewport.fitScale(), viewport.largestScale());
  zoomedAt_ = at;
  if (zoomedFrom_ != zoomedTo_) adw_animation_play(animation_);
}

void PictureGestures::zoomStep(double progress) {
  const double scale = progress >= 1 ? zoomedTo_ : zoomedFrom_ * std::pow(zoomedTo_ / zoomedFrom_, progress);
  canvas_.change([&](PictureViewport& viewport) { viewport.zoom(scale, zoomedAt_); });
}

void PictureGestures::pinched(GtkGesture* gesture, double change) {
  PictureViewport::Point at;
  if (!gtk_gesture_get_bounding_box_center(gesture, &at.x, &at.y)) return;
  canvas_.change([&](PictureViewport& viewport) {
    viewport.zoom(pinchedFrom_ * change, pinchedAt_);
    viewport.pan(at.x - pinchedAt_.x, at.y - pinchedAt_.y);
  });
  pinchedAt_ = at;
}

// A picture that is seen whole leaves the drag to others, as to the swipe back.
bool PictureGestures::dragged(double x, double y) {
  if (!canvas_.viewport().canPan()) return false;
  showCursor("grabbing");
  canvas_.change([&](PictureViewport& viewport) { viewport.pan(x - draggedTo_.x, y - draggedTo_.y); });
  draggedTo_ = {x, y};
  return true;
}

void PictureGestures::doubleTapped(PictureViewport::Point at) {
  const PictureViewport& viewport = canvas_.viewport();
  zoomSmoothly(isZoomedOut(viewport) ? viewport.closerScale() : viewport.fitScale(), at);
}

bool PictureGestures::scrolled(GtkEventControllerScroll* scroll, double dx, double dy) {
  const GdkModifierType state = gtk_event_controller_get_current_event_state(GTK_EVENT_CONTROLLER(scroll));
  const bool isWheel = gtk_event_controller_scroll_get_unit(scroll) == GDK_SCROLL_UNIT_WHEEL;
  if (isWheel && !(state & GDK_SHIFT_MASK)) {
    if (dy != 0) zoomBy(std::pow(WheelStep, -dy), pointer_);
    return dy != 0;
  }
  stopMoving();
  if (state & GDK_CONTROL_MASK) {
    canvas_.change(
        [&](PictureViewport& viewport) { viewport.zoom(viewport.scale() * std::pow(TouchpadStep, -dy), pointer_); });
    return true;
  }
  if (!canvas_.viewport().canPan()) return false;
  const double step = isWheel ? WheelPan : 1;
  // The toolkit turns a wheel with Shift sideways on some platforms only.
  const bool turns = isWheel && dx == 0;
  canvas_.change([&](PictureViewport& viewport) { viewport.pan(-(turns ? dy : dx) * step, turns ? 0 : -dy * step); });
  return true;
}

bool PictureGestures::pressed(guint key, GdkModifierType state) {
  if (state & GDK_ALT_MASK) return false;
  const auto pan = [&](double dx, double dy) {
    if (!canvas_.viewport().canPan()) return false;
    stopMoving();
    canvas_.change([&](PictureViewport& viewport) { viewport.pan(dx, dy); });
    return true;
  };
  switch (key) {
    case GDK_KEY_plus:
    case GDK_KEY_equal:
    case GDK_KEY_KP_Add:
      zoomIn();
      return true;
    case GDK_KEY_minus:
    case GDK_KEY_KP_Subtract:
      zoomOut();
      return true;
    case GDK_KEY_0:
    case GDK_KEY_KP_0:
      showWhole();
      return true;
    case GDK_KEY_1:
    case GDK_KEY_KP_1:
      zoomSmoothly(1, middle());
      return true;
    case GDK_KEY_Left:
      return pan(ArrowStep, 0);
    case GDK_KEY_Right:
      return pan(-ArrowStep, 0);
    case GDK_KEY_Up:
      return pan(0, ArrowStep);
    case GDK_KEY_Down:
      return pan(0, -ArrowStep);
    default:
      return false;
  }
}

void PictureGestures::flick(double velocityX, double velocityY) {
  if (!canvas_.viewport().canPan() || std::hypot(velocityX, velocityY) < Slowest) return;
  stopMoving();
  velocity_ = {velocityX, velocityY};
  flickTime_ = 0;
  flick_ = gtk_widget_add_tick_callback(
      canvas_.widget(),
      +[](GtkWidget*, GdkFrameClock* clock, gpointer self) -> gboolean {
        return static_cast<PictureGestures*>(self)->flickStep(gdk_frame_clock_get_frame_time(clock));
      },
      this, nullptr);
}

bool PictureGestures::flickStep(gint64 now) {
  const double seconds = flickTime_ == 0 ? 0 : static_cast<double>(now - flickTime_) / G_USEC_PER_SEC;
  flickTime_ = now;
  bool moved = true;
  canvas_.change([&](PictureViewport& viewport) {
    moved = seconds == 0 || viewport.pan(velocity_.x * seconds, velocity_.y * seconds);
  });
  const double kept = std::exp(-Friction * seconds);
  velocity_ = {velocity_.x * kept, velocity_.y * kept};
  if (moved && std::hypot(velocity_.x, velocity_.y) >= Slowest) return true;
  flick_ = 0;
  return false;
}

void PictureGestures::stopMoving() {
  if (flick_ != 0) gtk_widget_remove_tick_callback(canvas_.widget(), std::exchange(flick_, 0));
  adw_animation_pause(animation_);
}

void PictureGestures::showCursor(const char* name) { gtk_widget_set_cursor_from_name(canvas_.widget(), name); }

}  // namespace vaelo
