// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/gtk/preview/pages_gestures.h"

#include <cmath>

namespace vaelo {

namespace {
constexpr double Step = 1.15;
constexpr double DoubleTapFactor = 2;
}  // namespace

PagesGestures::PagesGestures(PagesCanvas& canvas, GtkWidget* scrolled) : canvas_(canvas), scrolled_(scrolled) {
  addPinch();

  GtkGesture* tap = gtk_gesture_click_new();
  gtk_gesture_single_set_touch_only(GTK_GESTURE_SINGLE(tap), TRUE);
  g_signal_connect(tap, "pressed", G_CALLBACK(+[](GtkGestureClick*, int count, double x, double y, PagesGestures* self) {
                     if (count == 2) self->doubleTapped(x, y);
                   }),
                   this);
  controllers_[1] = GTK_EVENT_CONTROLLER(tap);

  controllers_[2] = gtk_event_controller_scroll_new(GTK_EVENT_CONTROLLER_SCROLL_VERTICAL);
  g_signal_connect(controllers_[2], "scroll",
                   G_CALLBACK(+[](GtkEventControllerScroll* scroll, double, double y, PagesGestures* self) -> gboolean {
                     const auto state = gtk_event_controller_get_current_event_state(GTK_EVENT_CONTROLLER(scroll));
                     if (!(state & GDK_CONTROL_MASK)) return FALSE;
                     self->canvas_.zoomTo(self->canvas_.zoom() * std::pow(Step, -y), self->pointerX_, self->pointerY_);
                     return TRUE;
                   }),
                   this);
  controllers_[3] = gtk_event_controller_motion_new();
  g_signal_connect(controllers_[3], "motion",
                   G_CALLBACK(+[](GtkEventControllerMotion*, double x, double y, PagesGestures* self) {
                     self->pointerX_ = x;
                     self->pointerY_ = y;
                   }),
                   this);
  // Before the scrolled window's own ones, which would take a wheel or a finger for scrolling.
  for (GtkEventController* controller : controllers_) {
    gtk_event_controller_set_propagation_phase(controller, GTK_PHASE_CAPTURE);
    gtk_widget_add_controller(scrolled_, controller);
  }
}

PagesGestures::~PagesGestures() {
  for (GtkEventController* controller : controllers_) gtk_widget_remove_controller(scrolled_, controller);
}

void PagesGestures::addPinch() {
  GtkGesture* pinch = gtk_gesture_zoom_new();
  g_signal_connect(pinch, "begin", G_CALLBACK(+[](GtkGesture* gesture, GdkEventSequence*, PagesGestures* self) {
                     double x = 0;
                     double y = 0;
                     if (!gtk_gesture_get_bounding_box_center(gesture, &x, &y)) return;
                     self->pinched_ = self->canvas_.placeAt(x, y);
                     self->pinchedFrom_ = self->canvas_.zoom();
                     gtk_gesture_set_state(gesture, GTK_EVENT_SEQUENCE_CLAIMED);
                   }),
                   this);
  g_signal_connect(pinch, "scale-changed", G_CALLBACK(+[](GtkGesture* gesture, double scale, PagesGestures* self) {
                     double x = 0;
                     double y = 0;
                     if (!gtk_gesture_get_bounding_box_center(gesture, &x, &y)) return;
                     self->canvas_.zoomTo(self->pinchedFrom_ * scale, self->pinched_, x, y);
                   }),
                   this);
  controllers_[0] = GTK_EVENT_CONTROLLER(pinch);
}

void PagesGestures::doubleTapped(double x, double y) {
  const double fitting = canvas_.fittingZoom();
  if (canvas_.zoom() > fitting * 1.1) return canvas_.fit();
  canvas_.zoomTo(fitting * DoubleTapFactor, x, y);
}

void PagesGestures::zoomByStep(double steps) {
  canvas_.zoomTo(canvas_.zoom() * std::pow(Step, steps), canvas_.width() / 2, canvas_.height() / 2);
}

bool PagesGestures::key(guint key, GdkModifierType state) {
  if (state & GDK_ALT_MASK) return false;
  switch (key) {
    case GDK_KEY_plus:
    case GDK_KEY_equal:
    case GDK_KEY_KP_Add:
      zoomByStep(1);
      return true;
    case GDK_KEY_minus:
    case GDK_KEY_KP_Subtract:
      zoomByStep(-1);
      return true;
    case GDK_KEY_0:
    case GDK_KEY_KP_0:
      canvas_.fit();
      return true;
    default:
      break;
  }
  const bool backwards = (state & GDK_SHIFT_MASK) && key == GDK_KEY_space;
  return walk(backwards ? static_cast<guint>(GDK_KEY_Page_Up) : key);
}

bool PagesGestures::walk(guint key) {
  const double line = 60;
  const double screen = canvas_.height() * 0.9;
  switch (key) {
    case GDK_KEY_Page_Down:
    case GDK_KEY_KP_Page_Down:
    case GDK_KEY_space:
      canvas_.scrollBy(0, screen);
      return true;
    case GDK_KEY_Page_Up:
    case GDK_KEY_KP_Page_Up:
      canvas_.scrollBy(0, -screen);
      return true;
    case GDK_KEY_Down:
      canvas_.scrollBy(0, line);
      return true;
    case GDK_KEY_Up:
      canvas_.scrollBy(0, -line);
      return true;
    case GDK_KEY_Left:
      canvas_.scrollBy(-line, 0);
      return true;
    case GDK_KEY_Right:
      canvas_.scrollBy(line, 0);
      return true;
    case GDK_KEY_Home:
      canvas_.showPage(0);
      return true;
    case GDK_KEY_End:
      canvas_.scrollBy(0, canvas_.layout().height(canvas_.zoom()));
      return true;
    default:
      return false;
  }
}

}  // namespace vaelo
