// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/gtk/preview/text_note.h"

namespace vaelo {

GtkWidget* makePreviewNote() {
  GtkWidget* note = gtk_label_new(nullptr);
  gtk_label_set_wrap(GTK_LABEL(note), TRUE);
  gtk_label_set_justify(GTK_LABEL(note), GTK_JUSTIFY_CENTER);
  for (const char* name : {"caption", "dim-label"}) gtk_widget_add_css_class(note, name);
  gtk_widget_set_margin_start(note, 12);
  gtk_widget_set_margin_end(note, 12);
  gtk_widget_set_margin_top(note, 6);
  gtk_widget_set_margin_bottom(note, 6);
  gtk_widget_set_visible(note, FALSE);
  return note;
}

void setPreviewNote(GtkWidget* note, const std::string& text) {
  gtk_label_set_text(GTK_LABEL(note), text.c_str());
  gtk_widget_set_visible(note, !text.empty());
}

}  // namespace vaelo
