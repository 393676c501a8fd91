// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/gtk/page_stack.h"

#include <algorithm>
#include <utility>

#include "host/support/glib_ptr.h"

namespace vaelo {
namespace {

/// What takes a tap may keep its end from what lies around it. A gesture that waits for that end ever after follows no other
/// finger: the first tap on a row would be the last time that a swipe went back.
void forgetFingers(GtkWidget* widget) {
  const GRef<GListModel> controllers(gtk_widget_observe_controllers(widget));
  for (guint i = 0; i < g_list_model_get_n_items(controllers.get()); ++i) {
    const GRef<GObject> controller(G_OBJECT(g_list_model_get_item(controllers.get(), i)));
    if (!GTK_IS_GESTURE(controller.get())) continue;
    auto* gesture = GTK_EVENT_CONTROLLER(controller.get());
    // Those of the capture phase see the end, being asked first.
    if (gtk_event_controller_get_propagation_phase(gesture) == GTK_PHASE_BUBBLE) gtk_event_controller_reset(gesture);
  }
}

void forgetFingersBeforeTheFirst(GtkWidget* widget) {
  GtkEventController* touches = gtk_event_controller_legacy_new();
  gtk_event_controller_set_propagation_phase(touches, GTK_PHASE_CAPTURE);
  g_signal_connect(
      touches, "event", G_CALLBACK(+[](GtkEventController* self, GdkEvent* event) -> gboolean {
        // Only the first finger moves the pointer.
        if (gdk_event_get_event_type(event) == GDK_TOUCH_BEGIN && gdk_touch_event_get_emulating_pointer(event)) {
          forgetFingers(gtk_event_controller_get_widget(self));
        }
        return GDK_EVENT_PROPAGATE;
      }),
      nullptr);
  gtk_widget_add_controller(widget, touches);
}

}  // namespace

namespace {

void closeMenus(GtkWidget* widget) {
  GtkWidget* next = nullptr;
  for (GtkWidget* child = gtk_widget_get_first_child(widget); child; child = next) {
    next = gtk_widget_get_next_sibling(child);
    if (GTK_IS_POPOVER(child)) {
      gtk_popover_popdown(GTK_POPOVER(child));
    } else {
      closeMenus(child);
    }
  }
}

}  // namespace

PageStack::PageStack() : leaflet_(ADW_LEAFLET(g_object_ref_sink(adw_leaflet_new()))) {
  // Never side by side: a stack is one screen at a time on every window size.
  adw_leaflet_set_can_unfold(leaflet_, FALSE);
  adw_leaflet_set_can_navigate_back(leaflet_, TRUE);
  adw_leaflet_set_transition_type(leaflet_, ADW_LEAFLET_TRANSITION_TYPE_OVER);
  forgetFingersBeforeTheFirst(widget());
  g_signal_connect_swapped(leaflet_, "notify::child-transition-running", G_CALLBACK(+[](PageStack* self) {
                             if (!self->settingPages_ && !adw_leaflet_get_child_transition_running(self->leaflet_)) {
                               self->slideEnded();
                             }
                           }),
                           this);
}

PageStack::~PageStack() {
  g_signal_handlers_disconnect_by_data(leaflet_, this);
  g_object_unref(leaflet_);
}

void PageStack::setPages(const std::vector<GtkWidget*>& pages, bool animated, std::function<void()> done) {
  settingPages_ = true;
  removeLeavingPages();
  if (std::function<void()> earlier = std::exchange(done_, nullptr)) earlier();

  const auto isIn = [](const std::vector<GtkWidget*>& list, GtkWidget* page) {
    return std::find(list.begin(), list.end(), page) != list.end();
  };
  for (GtkWidget* page : pages_) {
    if (!isIn(pages, page)) leaving_.push_back(page);
  }
  GtkWidget* previous = nullptr;
  for (GtkWidget* page : pages) {
    if (!isIn(pages_, page)) {
      // After every leaving page, so that a replacement slides forwards.
      adw_leaflet_append(leaflet_, page);
    } else if (previous) {
      adw_leaflet_reorder_child_after(leaflet_, page, previous);
    }
    previous = page;
  }
  pages_ = pages;
  done_ = std::move(done);
  GtkWidget* top = pages_.empty() ? nullptr : pages_.back();
  const bool slides = animated && top && adw_leaflet_get_visible_child(leaflet_) &&
                      adw_leaflet_get_visible_child(leaflet_) != top && gtk_widget_get_mapped(widget());
  // A menu that is open would go with its page, but keep all presses and keys of the application to itself.
  GtkWidget* shown = adw_leaflet_get_visible_child(leaflet_);
  if (shown && shown != top) closeMenus(shown);
  if (top) {
    GtkSettings* settings = gtk_widget_get_settings(widget());
    gboolean wished = TRUE;
    g_object_get(settings, "gtk-enable-animations", &wished, nullptr);
    if (!slides && wished) g_object_set(settings, "gtk-enable-animations", FALSE, nullptr);
    adw_leaflet_set_visible_child(leaflet_, top);
    if (!slides && wished) g_object_set(settings, "gtk-enable-animations", TRUE, nullptr);
  }
  settingPages_ = false;
  if (!adw_leaflet_get_child_transition_running(leaflet_)) slideEnded();
}

void PageStack::slideEnded() {
  GtkWidget* visible = adw_leaflet_get_visible_child(leaflet_);
  const auto at = std::find(pages_.begin(), pages_.end(), visible);
  const std::size_t left = at == pages_.end() ? pages_.size() : static_cast<std::size_t>(at - pages_.begin()) + 1;
  removeLeavingPages();
  if (std::function<void()> done = std::exchange(done_, nullptr)) done();
  if (left < pages_.size() && swipedBack_) swipedBack_(left);
}

void PageStack::removeLeavingPages() {
  for (GtkWidget* page : std::exchange(leaving_, {})) adw_leaflet_remove(leaflet_, page);
}

}  // namespace vaelo
