// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/gtk/share_presentation.h"

#include <utility>

#include "host/gtk/gtk_window.h"
#include "host/gtk/menu_tooltip.h"

namespace vaelo {

namespace {

GtkWidget* kept(GtkWidget* widget) { return GTK_WIDGET(g_object_ref_sink(widget)); }

}  // namespace

std::optional<graphene_rect_t> areaOf(const Rect& rect, const ViewRef& view) {
  if (!view) return std::nullopt;
  View* root = view.get();
  while (root->superview()) root = root->superview();
  Rect there = view->convertRectTo(rect, *root);
  if (!view->isInWindow()) there = there.offsetBy(root->frame().x, root->frame().y);
  if (there.width <= 0) return std::nullopt;  // no view was given, so the rectangle is nowhere
  graphene_rect_t area;
  graphene_rect_init(&area, static_cast<float>(there.x), static_cast<float>(there.y), static_cast<float>(there.width),
                     static_cast<float>(there.height));
  return area;
}

SharePresentation::SharePresentation(const std::shared_ptr<GtkWindowHost>& window, GtkWidget* content,
                                     const ShareAnchor& anchor, std::function<void()> dismissed)
    : window_(window), dismissed_(std::move(dismissed)), overlay_(GTK_WIDGET(g_object_ref(window->overlay()))) {
  g_set_weak_pointer(&focusBefore_, gtk_window_get_focus(window->widget()));
  if (window->traitCollection().horizontalSizeClass == SizeClass::Compact) {
    riseFromBottom(content);
  } else {
    pointAt(content, anchor);
  }
}

SharePresentation::~SharePresentation() {
  drop();
  g_object_unref(overlay_);
}

void SharePresentation::riseFromBottom(GtkWidget* content) {
  flap_ = kept(adw_flap_new());
  AdwFlap* flap = ADW_FLAP(flap_);
  gtk_orientable_set_orientation(GTK_ORIENTABLE(flap), GTK_ORIENTATION_VERTICAL);
  adw_flap_set_flap_position(flap, GTK_PACK_END);
  adw_flap_set_fold_policy(flap, ADW_FLAP_FOLD_POLICY_ALWAYS);
  adw_flap_set_modal(flap, TRUE);
  adw_flap_set_swipe_to_open(flap, FALSE);
  adw_flap_set_reveal_flap(flap, FALSE);
  GtkWidget* beside = gtk_box_new(GTK_ORIENTATION_VERTICAL, 0);
  adw_flap_set_content(flap, beside);
  gtk_widget_add_css_class(content, "background");
  adw_flap_set_flap(flap, content);
  gtk_overlay_add_overlay(GTK_OVERLAY(overlay_), flap_);
  // The pages below are out of reach of the keyboard, as the shade keeps pointers from them.
  gtk_widget_set_can_focus(gtk_overlay_get_child(GTK_OVERLAY(overlay_)), FALSE);
  g_signal_connect_swapped(flap, "notify::reveal-progress", G_CALLBACK(+[](SharePresentation* self) {
                             AdwFlap* shown = ADW_FLAP(self->flap_);
                             if (!adw_flap_get_reveal_flap(shown) && adw_flap_get_reveal_progress(shown) <= 0) self->gone();
                           }),
                           this);
  // Before the window's own Escape, which would go back a page.
  GtkEventController* keys = gtk_event_controller_key_new();
  gtk_event_controller_set_propagation_phase(keys, GTK_PHASE_CAPTURE);
  g_signal_connect(
      keys, "key-pressed",
      G_CALLBACK(+[](GtkEventController*, guint key, guint, GdkModifierType, SharePresentation* self) -> gboolean {
        if (key != GDK_KEY_Escape) return FALSE;
        self->close();
        return TRUE;
      }),
      this);
  gtk_widget_add_controller(flap_, keys);
  // How far it has to rise is known once it has a size; without, its place is no number.
  rising_ = gtk_widget_add_tick_callback(
      flap_,
      +[](GtkWidget* widget, GdkFrameClock*, gpointer held) -> gboolean {
        if (gtk_widget_get_height(widget) == 0) return G_SOURCE_CONTINUE;
        static_cast<SharePresentation*>(held)->rising_ = 0;
        adw_flap_set_reveal_flap(ADW_FLAP(widget), TRUE);
        return G_SOURCE_REMOVE;
      },
      this, nullptr);
  gtk_widget_child_focus(content, GTK_DIR_TAB_FORWARD);
}

void SharePresentation::pointAt(GtkWidget* content, const ShareAnchor& anchor) {
  popover_ = kept(gtk_popover_new());
  GtkPopover* popover = GTK_POPOVER(popover_);
  gtk_popover_set_child(popover, content);
  gtk_widget_set_parent(popover_, overlay_);
  graphene_rect_t area;
  const bool pointing =
      anchor.widget ? gtk_widget_compute_bounds(anchor.widget, overlay_, &area) : anchor.area && (area = *anchor.area, true);
  if (!pointing) {
    graphene_rect_init(&area, 0, 0, static_cast<float>(gtk_widget_get_width(overlay_)),
                       static_cast<float>(gtk_widget_get_height(overlay_)) / 2);
    gtk_popover_set_has_arrow(popover, FALSE);
  }
  const GdkRectangle rectangle{static_cast<int>(area.origin.x), static_cast<int>(area.origin.y),
                               static_cast<int>(area.size.width), static_cast<int>(area.size.height)};
  gtk_popover_set_pointing_to(popover, &rectangle);
  const bool low = rectangle.y + rectangle.height / 2 > gtk_widget_get_height(overlay_) / 2;
  gtk_popover_set_position(popover, low ? GTK_POS_TOP : GTK_POS_BOTTOM);
  if (anchor.widget && gtk_widget_get_has_tooltip(anchor.widget)) hideTooltipWhileShown(anchor.widget, popover_);
  g_signal_connect_swapped(popover, "closed", G_CALLBACK(+[](SharePresentation* self) { self->gone(); }), this);
  gtk_popover_popup(popover);
}

void SharePresentation::close(std::function<void()> then) {
  if (then) then_ = std::move(then);
  if (popover_) {
    gtk_popover_popdown(GTK_POPOVER(popover_));
  } else if (rising_) {
    gone();  // there is nothing to be seen yet
  } else if (flap_) {
    adw_flap_set_reveal_flap(ADW_FLAP(flap_), FALSE);
  }
}

void SharePresentation::gone() {
  if (ending_) return;
  // Not from within the widget's own signal, which it must survive.
  ending_ = g_idle_add_full(
      G_PRIORITY_DEFAULT,
      [](gpointer held) -> gboolean {
        auto* self = static_cast<SharePresentation*>(held);
        self->ending_ = 0;
        self->drop();
        // Either may end this object.
        const auto dismissed = std::exchange(self->dismissed_, nullptr);
        const auto then = std::exchange(self->then_, nullptr);
        if (dismissed) dismissed();
        if (then) then();
        return G_SOURCE_REMOVE;
      },
      this, nullptr);
}

void SharePresentation::drop() {
  if (ending_) g_source_remove(std::exchange(ending_, 0));
  if (popover_) {
    g_signal_handlers_disconnect_by_data(popover_, this);
    // One that goes while it shows would keep the keyboard.
    gtk_widget_set_visible(popover_, FALSE);
    gtk_widget_unparent(popover_);
    g_object_unref(std::exchange(popover_, nullptr));
  }
  if (flap_) {
    if (rising_) gtk_widget_remove_tick_callback(flap_, std::exchange(rising_, 0));
    g_signal_handlers_disconnect_by_data(flap_, this);
    // A window that ended first has let go of it.
    if (gtk_widget_get_parent(flap_) == overlay_) gtk_overlay_remove_overlay(GTK_OVERLAY(overlay_), flap_);
    g_object_unref(std::exchange(flap_, nullptr));
    if (GtkWidget* pages = gtk_overlay_get_child(GTK_OVERLAY(overlay_))) gtk_widget_set_can_focus(pages, TRUE);
  }
  if (const auto window = window_.lock()) window->returnFocus(focusBefore_);
  g_clear_weak_pointer(&focusBefore_);
}

}  // namespace vaelo
