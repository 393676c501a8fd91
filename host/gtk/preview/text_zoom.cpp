// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/gtk/preview/text_zoom.h"

#include <algorithm>
#include <cmath>
#include <string>

namespace vaelo {

namespace {
constexpr double Step = 1.1;
constexpr double Smallest = 0.5;
constexpr double Largest = 4;
}  // namespace

TextZoom::TextZoom(GtkWidget* view)
    : view_(GTK_WIDGET(g_object_ref(view))),
      provider_(gtk_css_provider_new()),
      controllers_{GTK_EVENT_CONTROLLER(gtk_gesture_zoom_new()),
                   gtk_event_controller_scroll_new(GTK_EVENT_CONTROLLER_SCROLL_VERTICAL), gtk_event_controller_key_new()} {
  gtk_style_context_add_provider(gtk_widget_get_style_context(view), GTK_STYLE_PROVIDER(provider_.get()),
                                 GTK_STYLE_PROVIDER_PRIORITY_APPLICATION);
  for (GtkEventController* controller : controllers_) {
    gtk_event_controller_set_propagation_phase(controller, GTK_PHASE_CAPTURE);
    gtk_widget_add_controller(view, controller);
  }
  g_signal_connect(controllers_[0], "begin",
                   G_CALLBACK(+[](GtkGesture*, GdkEventSequence*, TextZoom* self) { self->pinchedFrom_ = self->scale_; }),
                   this);
  g_signal_connect(controllers_[0], "scale-changed", G_CALLBACK(+[](GtkGestureZoom*, double change, TextZoom* self) {
                     self->setScale(self->pinchedFrom_ * change);
                   }),
                   this);
  g_signal_connect(controllers_[1], "scroll",
                   G_CALLBACK(+[](GtkEventControllerScroll* scroll, double, double y, TextZoom* self) -> gboolean {
                     const auto state = gtk_event_controller_get_current_event_state(GTK_EVENT_CONTROLLER(scroll));
                     if (!(state & GDK_CONTROL_MASK)) return FALSE;
                     self->setScale(self->scale_ * std::pow(Step, -y));
                     return TRUE;
                   }),
                   this);
  g_signal_connect(controllers_[2], "key-pressed",
                   G_CALLBACK(+[](GtkEventControllerKey*, guint key, guint, GdkModifierType state,
                                  TextZoom* self) -> gboolean { return (state & GDK_CONTROL_MASK) && self->key(key); }),
                   this);
}

TextZoom::~TextZoom() {
  for (GtkEventController* controller : controllers_) gtk_widget_remove_controller(view_.get(), controller);
}

bool TextZoom::key(guint key) {
  switch (key) {
    case GDK_KEY_plus:
    case GDK_KEY_equal:
    case GDK_KEY_KP_Add:
      setScale(scale_ * Step);
      return true;
    case GDK_KEY_minus:
    case GDK_KEY_KP_Subtract:
      setScale(scale_ / Step);
      return true;
    case GDK_KEY_0:
    case GDK_KEY_KP_0:
      setScale(1);
      return true;
    default:
      return false;
  }
}

void TextZoom::setScale(double scale) {
  scale_ = std::clamp(scale, Smallest, Largest);
  const std::string css = "textview { font-size: " + std::to_string(std::lround(scale_ * 100)) + "%; }";
  gtk_css_provider_load_from_data(provider_.get(), css.c_str(), -1);
}

}  // namespace vaelo
