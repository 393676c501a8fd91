// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/gtk/preview/text_find_bar.h"

#include <string>

#include "host/support/texts.h"

namespace vaelo {

TextFindBar::TextFindBar(GtkTextView* view)
    : view_(view),
      bar_(GTK_WIDGET(view),
           {[this](const std::string& text) { searchChanged(text); }, [this](bool forward) { step(forward); }}),
      settings_(gtk_source_search_settings_new()) {
  gtk_source_search_settings_set_wrap_around(settings_.get(), TRUE);
}

TextFindBar::~TextFindBar() { setBuffer(nullptr); }

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

void TextFindBar::searchChanged(const std::string& text) {
  if (!context_) return;
  gtk_source_search_settings_set_search_text(settings_.get(), text.empty() ? nullptr : text.c_str());
  showCount();
  if (text.empty()) return;
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
    text = position > 0 ? filled(_("%s of %s"), {numberText(position), numberText(count)}) : numberText(count);
    if (count == 0) text = _("Not found");
  }
  bar_.showCount(text, count == 0 && searching);
}

}  // namespace vaelo
