// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/gtk/preview/find_bar.h"

#include "host/support/texts.h"

namespace vaelo {

namespace {

GtkWidget* makeButton(const char* icon, const char* label) {
  GtkWidget* button = gtk_button_new_from_icon_name(icon);
  gtk_widget_set_tooltip_text(button, label);
  gtk_accessible_update_property(GTK_ACCESSIBLE(button), GTK_ACCESSIBLE_PROPERTY_LABEL, label, -1);
  return button;
}

}  // namespace

FindBar::FindBar(GtkWidget* content, Events events)
    : content_(content),
      events_(std::move(events)),
      bar_(GTK_WIDGET(g_object_ref_sink(gtk_search_bar_new()))),
      entry_(gtk_search_entry_new()),
      count_(gtk_label_new(nullptr)) {
  GtkWidget* back = makeButton("go-up-symbolic", _("Find Previous"));
  GtkWidget* onwards = makeButton("go-down-symbolic", _("Find Next"));
  GtkWidget* box = gtk_box_new(GTK_ORIENTATION_HORIZONTAL, 6);
  gtk_widget_set_hexpand(entry_, TRUE);
  gtk_accessible_update_property(GTK_ACCESSIBLE(entry_), GTK_ACCESSIBLE_PROPERTY_LABEL, _("Find in this document"), -1);
  gtk_widget_add_css_class(count_, "dim-label");
  gtk_widget_add_css_class(count_, "numeric");
  for (GtkWidget* child : {entry_, count_, back, onwards}) gtk_box_append(GTK_BOX(box), child);
  GtkWidget* clamp = adw_clamp_new();
  adw_clamp_set_child(ADW_CLAMP(clamp), box);
  gtk_widget_set_hexpand(clamp, TRUE);
  gtk_search_bar_set_child(GTK_SEARCH_BAR(bar_), clamp);
  gtk_search_bar_connect_entry(GTK_SEARCH_BAR(bar_), GTK_EDITABLE(entry_));

  g_signal_connect_swapped(entry_, "search-changed", G_CALLBACK(+[](FindBar* self) { self->textChanged(); }), this);
  for (const char* signal : {"activate", "next-match"}) {
    g_signal_connect_swapped(entry_, signal, G_CALLBACK(+[](FindBar* self) { self->step(true); }), this);
  }
  g_signal_connect_swapped(entry_, "previous-match", G_CALLBACK(+[](FindBar* self) { self->step(false); }), this);
  g_signal_connect_swapped(onwards, "clicked", G_CALLBACK(+[](FindBar* self) { self->step(true); }), this);
  g_signal_connect_swapped(back, "clicked", G_CALLBACK(+[](FindBar* self) { self->step(false); }), this);
  // At Escape the entry closes the bar by itself. It would keep the focus until it is out of sight, and take what is
  // pressed.
  g_signal_connect_swapped(bar_, "notify::search-mode-enabled", G_CALLBACK(+[](FindBar* self) {
                             if (gtk_search_bar_get_search_mode(GTK_SEARCH_BAR(self->bar_))) return;
                             self->textChanged();
                             gtk_widget_grab_focus(self->content_);
                           }),
                           this);
  GtkEventController* keys = gtk_event_controller_key_new();
  gtk_event_controller_set_propagation_phase(keys, GTK_PHASE_CAPTURE);
  g_signal_connect(
      keys, "key-pressed",
      G_CALLBACK(+[](GtkEventControllerKey*, guint key, guint, GdkModifierType state, FindBar* self) -> gboolean {
        if (!(state & GDK_SHIFT_MASK) || (key != GDK_KEY_Return && key != GDK_KEY_KP_Enter)) return FALSE;
        self->step(false);
        return TRUE;
      }),
      this);
  gtk_widget_add_controller(entry_, keys);
}

FindBar::~FindBar() {
  // The widgets go with the page, which may be later.
  g_signal_handlers_disconnect_by_data(bar_, this);
  gtk_search_bar_set_child(GTK_SEARCH_BAR(bar_), nullptr);
  g_object_unref(bar_);
}

void FindBar::toggle() {
  const bool open = !gtk_search_bar_get_search_mode(GTK_SEARCH_BAR(bar_));
  gtk_search_bar_set_search_mode(GTK_SEARCH_BAR(bar_), open);
  if (open) gtk_widget_grab_focus(entry_);
}

bool FindBar::close() {
  if (!gtk_search_bar_get_search_mode(GTK_SEARCH_BAR(bar_))) return false;
  gtk_search_bar_set_search_mode(GTK_SEARCH_BAR(bar_), FALSE);
  return true;
}

std::string FindBar::text() const {
  const bool open = gtk_search_bar_get_search_mode(GTK_SEARCH_BAR(bar_));
  return open ? gtk_editable_get_text(GTK_EDITABLE(entry_)) : "";
}

void FindBar::textChanged() {
  told_ = text();
  events_.changed(told_);
}

// The entry waits a moment for more letters before it says that it changed; who presses Enter doesn't.
void FindBar::step(bool forward) { text() == told_ ? events_.step(forward) : textChanged(); }

void FindBar::showCount(const std::string& count, bool nothingFound) {
  gtk_label_set_text(GTK_LABEL(count_), count.c_str());
  nothingFound ? gtk_widget_add_css_class(entry_, "error") : gtk_widget_remove_css_class(entry_, "error");
}

GtkWidget* makeFindButton(GCallback activated, gpointer data) {
  GtkWidget* find = makeButton("edit-find-symbolic", _("Find in This Document"));
  g_signal_connect_swapped(find, "clicked", activated, data);
  return find;
}

}  // namespace vaelo
