// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/gtk/toast.h"

#include <algorithm>
#include <utility>

#include "host/gtk/pango_graphics.h"

namespace vaelo {

namespace {

using Room = std::function<ToastRoom()>;

constexpr const char* RoomKey = "vaelo-toast-room";
constexpr const char* ButtonKey = "vaelo-toast-button";

// Of Chinese, Japanese and Korean letters one is as wide as two others.
int widthInCharacters(const char* text) {
  int width = 0;
  for (; *text; text = g_utf8_next_char(text)) width += g_unichar_iswide(g_utf8_get_char(text)) ? 2 : 1;
  return width;
}

// A toast gets the height of its widest shape. If that is wider than the window, what ends the toast is cut off.
int charactersFor(int width, const char* button) {
  constexpr int phoneWidth = 360;
  constexpr double onPhone = 32;   // characters of the usual size, beside the button that closes it
  constexpr double readable = 80;  // in one line
  constexpr double edges = 6;      // of another button
  const double scale = std::max(textScale(), 1.0);
  const double fitting = std::clamp(onPhone * width / phoneWidth, 1.0, readable);
  if (!*button) return std::max(static_cast<int>(fitting / scale), 1);
  return std::max(static_cast<int>((fitting - edges) / scale) - widthInCharacters(button), 1);
}

void fit(GtkWidget* label, AdwToastOverlay* toasts) {
  const auto* ask = static_cast<const Room*>(g_object_get_data(G_OBJECT(toasts), RoomKey));
  const ToastRoom room = ask ? (*ask)() : ToastRoom();
  const auto* button = static_cast<const char*>(g_object_get_data(G_OBJECT(label), ButtonKey));
  gtk_label_set_max_width_chars(GTK_LABEL(label), charactersFor(room.width, button));
  GtkWidget* toast = label;
  while (toast && gtk_widget_get_parent(toast) != GTK_WIDGET(toasts)) toast = gtk_widget_get_parent(toast);
  if (toast) gtk_widget_set_margin_bottom(toast, room.below);
}

void fitWhenShown(GtkWidget* label, gpointer) {
  GtkWidget* toasts = gtk_widget_get_ancestor(label, ADW_TYPE_TOAST_OVERLAY);
  if (toasts) fit(label, ADW_TOAST_OVERLAY(toasts));
}

/// The label that makeToast() made below `widget`, if any.
GtkWidget* labelIn(GtkWidget* widget) {
  if (GTK_IS_LABEL(widget) && g_object_get_data(G_OBJECT(widget), ButtonKey)) return widget;
  for (GtkWidget* child = gtk_widget_get_first_child(widget); child; child = gtk_widget_get_next_sibling(child)) {
    if (GtkWidget* found = labelIn(child)) return found;
  }
  return nullptr;
}

}  // namespace

AdwToast* makeToast(const std::string& text, const char* button) {
  // A toast's own title is one line of markup: too short for a phone, and a name with "&" shows nothing.
  GtkWidget* label = gtk_label_new(text.c_str());
  gtk_label_set_wrap(GTK_LABEL(label), TRUE);
  gtk_label_set_wrap_mode(GTK_LABEL(label), PANGO_WRAP_WORD_CHAR);
  gtk_label_set_xalign(GTK_LABEL(label), 0);
  gtk_widget_add_css_class(label, "heading");
  g_object_set_data_full(G_OBJECT(label), ButtonKey, g_strdup(button ? button : ""), g_free);
  g_signal_connect(label, "map", G_CALLBACK(fitWhenShown), nullptr);
  AdwToast* toast = adw_toast_new("");
  adw_toast_set_custom_title(toast, label);
  if (button) adw_toast_set_button_label(toast, button);
  return toast;
}

void setToastRoom(AdwToastOverlay* toasts, std::function<ToastRoom()> room) {
  g_object_set_data_full(G_OBJECT(toasts), RoomKey, new Room(std::move(room)),
                         [](gpointer held) { delete static_cast<Room*>(held); });
}

void fitToasts(AdwToastOverlay* toasts) {
  GtkWidget* content = adw_toast_overlay_get_child(toasts);
  for (GtkWidget* child = gtk_widget_get_first_child(GTK_WIDGET(toasts)); child;
       child = gtk_widget_get_next_sibling(child)) {
    GtkWidget* label = child == content ? nullptr : labelIn(child);
    if (label) fit(label, toasts);
  }
}

}  // namespace vaelo
