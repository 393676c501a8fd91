// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/gtk/toast.h"

#include <algorithm>

#include "host/gtk/pango_graphics.h"

namespace vaelo {

namespace {

// Of Chinese, Japanese and Korean letters one is as wide as two others.
int widthInCharacters(const char* text) {
  int width = 0;
  for (; *text; text = g_utf8_next_char(text)) width += g_unichar_iswide(g_utf8_get_char(text)) ? 2 : 1;
  return width;
}

// A toast gets the height of its widest shape. If that is wider than the window, what ends the toast is cut off.
int widthBeside(const char* button) {
  constexpr double phoneWidth = 32;  // characters of the usual size, beside the button that closes it
  constexpr double edges = 6;        // of another button
  const double scale = std::max(textScale(), 1.0);
  if (!button) return static_cast<int>(phoneWidth / scale);
  return std::max(static_cast<int>((phoneWidth - edges) / scale) - widthInCharacters(button), 1);
}

}  // namespace

AdwToast* makeToast(const std::string& text, const char* button) {
  // A toast's own title is one line of markup: too short for a phone, and a name with "&" shows nothing.
  GtkWidget* label = gtk_label_new(text.c_str());
  gtk_label_set_wrap(GTK_LABEL(label), TRUE);
  gtk_label_set_wrap_mode(GTK_LABEL(label), PANGO_WRAP_WORD_CHAR);
  gtk_label_set_max_width_chars(GTK_LABEL(label), widthBeside(button));
  gtk_label_set_xalign(GTK_LABEL(label), 0);
  gtk_widget_add_css_class(label, "heading");
  AdwToast* toast = adw_toast_new("");
  adw_toast_set_custom_title(toast, label);
  if (button) adw_toast_set_button_label(toast, button);
  return toast;
}

}  // namespace vaelo
