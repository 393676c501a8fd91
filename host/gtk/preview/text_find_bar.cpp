// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/gtk/preview/text_find_bar.h"

#include <string>

namespace vaelo {

namespace {

GtkWidget* makeButton(const char* icon, const char* label) {
  GtkWidget* button = gtk_button_new_from_icon_name(icon);
  gtk_widget_set_tooltip_text(button, label);
  gtk_accessible_update_property(GTK_ACCESSIBLE(button), GTK_ACCESSIBLE_PROPERTY_LABEL, label, -1);
  return button;
}

}  // namespace

TextFindBar::TextFindBar(GtkTextView* view)
    : view_(view),
      bar_(GTK_WIDGET(g_object_ref_sink(gtk_search_bar_new()))),
      entry_(gtk_search_entry_new()),
      count_(gtk_label_new(nullptr)),
      settings_(gtk_source_search_settings_new()) {
  gtk_source_search_settings_set_wrap_around(settings_.get(), TRUE);
  GtkWidget* back = makeButton("go-up-symbolic", "Find Previous");
  GtkWidget* onwards = makeButton("go-down-symbolic", "Find Next");
  GtkWidget* box = gtk_box_new(GTK_ORIENTATION_HORIZONTAL, 6);
  gtk_widget_set_hexpand(entry_, TRUE);
  gtk_accessible_update_property(GTK_ACCESSIBLE(entry_), GTK_ACCESSIBLE_PROPERTY_LABEL, "Find in this document", -1);
  gtk_widget_add_css_class(count_, "dim-label");
  gtk_widget_add_css_class(count_, "numeric");
  for (GtkWidget* child : {entry_, count_, back, onwards}) gtk_box_append(GTK_BOX(box), child);
  GtkWidget* clamp = adw_clamp_new();
  adw_clamp_set_child(ADW_CLAMP(clamp), box);
  gtk_widget_set_hexpand(clamp, TRUE);
  gtk_search_bar_set_child(GTK_SEARCH_BAR(bar_), clamp);
  gtk_search_bar_connect_entry(GTK_SEARCH_BAR(bar_), GTK_EDITABLE(entry_));

  g_signal_connect_swapped(entry_, "search-changed", G_CALLBACK(+[](TextFindBar* self) { self->searchChanged(); }), this);
  for (const char* signal : {"activate", "next-match"}) {
    g_signal_connect_swapped(entry_, signal, G_CALLBACK(+[](TextFindBar* self) { self->step(true); }), this);
  }
  g_signal_connect_swapped(entry_, "previous-match", G_CALLBACK(+[](TextFindBar* self) { self->step(false); }), this);
  g_signal_connect_swapped(onwards, "clicked", G_CALLBACK(+[](TextFindBar* self) { self->step(true); }), this);
  g_signal_connect_swapped(back, "clicked", G_CALLBACK(+[](TextFindBar* self) { self->step(false); }), this);
  g_signal_connect_swapped(bar_, "notify::search-mode-enabled", G_CALLBACK(+[](TextFindBar* self) {
                             if (!gtk_search_bar_get_search_mode(GTK_SEARCH_BAR(self->bar_))) self->searchChanged();
                           }),
                           this);
  GtkEventController* keys = gtk_event_controller_key_new();
  gtk_event_controller_set_propagation_phase(keys, GTK_PHASE_CAPTURE);
  g_signal_connect(
      keys, "key-pressed",
      G_CALLBACK(+[](GtkEventControllerKey*, guint key, guint, GdkModifierType state, TextFindBar* self) -> gboolean {
        if (!(state & GDK_SHIFT_MASK) || (key != GDK_KEY_Return && key != GDK_KEY_KP_Enter)) return FALSE;
        self->step(false);
        return TRUE;
      }),
      this);
  gtk_widget_add_controller(entry_, keys);
}

TextFindBar::~TextFindBar() {
  setBuffer(nullptr);
  // The widgets go with the page, which may be later.
  gtk_search_bar_set_child(GTK_SEARCH_BAR(bar_), nullptr);
  g_signal_handlers_disconnect_by_data(bar_, this);
  g_object_unref(bar_);
}

void TextFindBar::setBuffer(GtkSourceBuffer* buffer) {
  if (searching_) g_cancellable_cancel(searching_.get());
  searching_.reset();
  if (context_) g_signal_handlers_disconnect_by_data(context_.get(), this);
  context_.reset();
  if (!buffer) return;
  context_.reset(gtk_source_search_context_new(buffer, settings_.get()));
  g_signal_connect_swapped(context_.get(), "notify::occurrences-count",
                           G_CALLBACK(+[](TextFindBar* self) { self->showCount(); }), this);
}

void TextFindBar::toggle() {
  const bool open = !gtk_search_bar_get_search_mode(GTK_SEARCH_BAR(bar_));
  gtk_search_bar_set_search_mode(GTK_SEARCH_BAR(bar_), open);
  if (open) gtk_widget_grab_focus(entry_);
}

bool TextFindBar::close() {
  if (!gtk_search_bar_get_search_mode(GTK_SEARCH_BAR(bar_))) return false;
  gtk_search_bar_set_search_mode(GTK_SEARCH_BAR(bar_), FALSE);
  gtk_widget_grab_focus(GTK_WIDGET(view_));
  return true;
}

void TextFindBar::searchChanged() {
  if (!context_) return;
  const bool open = gtk_search_bar_get_search_mode(GTK_SEARCH_BAR(bar_));
  const char* text = open ? gtk_editable_get_text(GTK_EDITABLE(entry_)) : "";
  gtk_source_search_settings_set_search_text(settings_.get(), *text ? text : nullptr);
  showCount();
  if (!*text) return;
  // From where the selection begins, so that a longer text stays where its beginning was found.
  GtkTextBuffer* buffer = gtk_text_view_get_buffer(view_);
  GtkTextIter begin;
  gtk_text_buffer_get_selection_bounds(buffer, &begin, nullptr);
  gtk_text_buffer_place_cursor(buffer, &begin);
  step(true);
}

void TextFindBar::step(bool forward) {
  if (!context_ || !gtk_source_search_settings_get_search_text(settings_.get())) return;
  if (searching_) g_cancellable_cancel(searching_.get());
  searching_.reset(g_cancellable_new());
  GtkTextIter begin;
  GtkTextIter end;
  gtk_text_buffer_get_selection_bounds(gtk_text_view_get_buffer(view_), &begin, &end);
  if (forward) {
    gtk_source_search_context_forward_async(
        context_.get(), &end, searching_.get(),
        [](GObject* source, GAsyncResult* result, gpointer self) {
          GtkTextIter from;
          GtkTextIter to;
          GError* error = nullptr;
          const bool found = gtk_source_search_context_forward_finish(GTK_SOURCE_SEARCH_CONTEXT(source), result, &from, &to,
                                                                      nullptr, &error);
          const GErrorPtr owned(error);
          if (found) static_cast<TextFindBar*>(self)->found(from, to);
        },
        this);
    return;
  }
  gtk_source_search_context_backward_async(
      context_.get(), &begin, searching_.get(),
      [](GObject* source, GAsyncResult* result, gpointer self) {
        GtkTextIter from;
        GtkTextIter to;
        GError* error = nullptr;
        const bool found = gtk_source_search_context_backward_finish(GTK_SOURCE_SEARCH_CONTEXT(source), result, &from, &to,
                                                                     nullptr, &error);
        const GErrorPtr owned(error);
        if (found) static_cast<TextFindBar*>(self)->found(from, to);
      },
      this);
}

void TextFindBar::found(const GtkTextIter& begin, const GtkTextIter& end) {
  GtkTextBuffer* buffer = gtk_text_view_get_buffer(view_);
  gtk_text_buffer_select_range(buffer, &begin, &end);
  gtk_text_view_scroll_to_mark(view_, gtk_text_buffer_get_insert(buffer), 0.2, FALSE, 0, 0);
  showCount();
}

void TextFindBar::showCount() {
  const int count = context_ ? gtk_source_search_context_get_occurrences_count(context_.get()) : -1;
  const bool searching = gtk_source_search_settings_get_search_text(settings_.get()) != nullptr;
  std::string text;
  if (searching && count >= 0) {
    GtkTextIter begin;
    GtkTextIter end;
    gtk_text_buffer_get_selection_bounds(gtk_text_view_get_buffer(view_), &begin, &end);
    const int position = gtk_source_search_context_get_occurrence_position(context_.get(), &begin, &end);
    text = position > 0 ? std::to_string(position) + " of " + std::to_string(count) : std::to_string(count);
    if (count == 0) text = "Not found";
  }
  gtk_label_set_text(GTK_LABEL(count_), text.c_str());
  count == 0 && searching ? gtk_widget_add_css_class(entry_, "error") : gtk_widget_remove_css_class(entry_, "error");
}

}  // namespace vaelo
