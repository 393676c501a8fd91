// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/gtk/preview/text_widgets.h"

#include <vector>

namespace vaelo {

namespace {

constexpr gint64 EndingSlice = 6000;  // microseconds
// A highlighted text takes a time that grows with the square of what goes at once.
constexpr int LinesAtOnce = 4;
// While one document is shown another one is loaded, and a third one may still be going.
constexpr std::size_t MostSpares = 3;

std::vector<GRef<GtkSourceBuffer>>& spareBuffers() {
  static auto& spares = *new std::vector<GRef<GtkSourceBuffer>>;  // the toolkit may be gone before what is static
  return spares;
}

void removeNamedTags(GtkTextTagTable* table) {
  std::vector<GtkTextTag*> named;
  gtk_text_tag_table_foreach(
      table,
      +[](GtkTextTag* tag, gpointer found) {
        char* name = nullptr;
        g_object_get(tag, "name", &name, nullptr);
        if (name) static_cast<std::vector<GtkTextTag*>*>(found)->push_back(tag);
        g_free(name);
      },
      &named);
  for (GtkTextTag* tag : named) gtk_text_tag_table_remove(table, tag);
}

// What something still holds, or has left tags of its own in, isn't as a new one is.
void keepForNext(GRef<GtkSourceBuffer> buffer) {
  gtk_source_buffer_set_language(buffer.get(), nullptr);
  GtkTextTagTable* table = gtk_text_buffer_get_tag_table(GTK_TEXT_BUFFER(buffer.get()));
  removeNamedTags(table);
  const bool isAsNew = G_OBJECT(buffer.get())->ref_count == 1 && gtk_text_tag_table_get_size(table) == 0;
  if (isAsNew && spareBuffers().size() < MostSpares) spareBuffers().push_back(std::move(buffer));
}

// Each view leaves a mark in it, so it doesn't serve for ever.
GtkTextBuffer* sharedEmptyBuffer(GtkTextView*) {
  constexpr int mostViews = 64;
  static GtkSourceBuffer* empty = nullptr;
  static int views = 0;
  if (views++ % mostViews == 0) {
    g_clear_object(&empty);
    empty = gtk_source_buffer_new(nullptr);
  }
  return GTK_TEXT_BUFFER(g_object_ref(empty));
}

}  // namespace

GRef<GtkSourceBuffer> takeTextBuffer() {
  if (!spareBuffers().empty()) {
    GRef<GtkSourceBuffer> spare = std::move(spareBuffers().back());
    spareBuffers().pop_back();
    return spare;
  }
  GRef<GtkSourceBuffer> buffer(gtk_source_buffer_new(nullptr));
  gtk_text_buffer_set_enable_undo(GTK_TEXT_BUFFER(buffer.get()), FALSE);
  gtk_source_buffer_set_highlight_matching_brackets(buffer.get(), FALSE);
  return buffer;
}

void endTextBuffer(GRef<GtkSourceBuffer> buffer) {
  g_idle_add(
      +[](gpointer data) -> gboolean {
        auto* text = static_cast<GtkTextBuffer*>(data);
        const gint64 sliceEnds = g_get_monotonic_time() + EndingSlice;
        while (gtk_text_buffer_get_char_count(text) > 0 && g_get_monotonic_time() < sliceEnds) {
          GtkTextIter begin;
          GtkTextIter end;
          gtk_text_buffer_get_end_iter(text, &end);
          begin = end;
          gtk_text_iter_backward_lines(&begin, LinesAtOnce);
          gtk_text_buffer_delete(text, &begin, &end);
        }
        if (gtk_text_buffer_get_char_count(text) > 0) return G_SOURCE_CONTINUE;
        keepForNext(GRef<GtkSourceBuffer>(GTK_SOURCE_BUFFER(data)));
        return G_SOURCE_REMOVE;
      },
      buffer.release());
}

GtkWidget* makeTextWidget() {
  auto* type = static_cast<GtkTextViewClass*>(g_type_class_ref(GTK_SOURCE_TYPE_VIEW));
  type->create_buffer = sharedEmptyBuffer;
  g_type_class_unref(type);
  return gtk_source_view_new();
}

}  // namespace vaelo
