// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/gtk/preview/text_buffer_end.h"

namespace vaelo {

namespace {

constexpr gint64 EndingSlice = 6000;  // microseconds
// A highlighted text takes a time that grows with the square of what goes at once.
constexpr int LinesAtOnce = 4;

}  // namespace

void endTextBuffer(GRef<GtkSourceBuffer> buffer) {
  g_idle_add_full(
      G_PRIORITY_DEFAULT_IDLE,
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
        return gtk_text_buffer_get_char_count(text) > 0 ? G_SOURCE_CONTINUE : G_SOURCE_REMOVE;
      },
      buffer.release(), g_object_unref);
}

}  // namespace vaelo
