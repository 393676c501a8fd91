// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/gtk/preview/note_popover.h"

#include <algorithm>

#include "host/support/glib_ptr.h"
#include "host/support/texts.h"

namespace vaelo {

NotePopover::NotePopover(GtkWidget* parent, GtkWidget* content)
    : content_(content), popover_(gtk_popover_new()), text_(gtk_text_view_new()), done_(gtk_button_new()) {
  gtk_text_view_set_wrap_mode(GTK_TEXT_VIEW(text_), GTK_WRAP_WORD_CHAR);
  gtk_text_view_set_accepts_tab(GTK_TEXT_VIEW(text_), FALSE);
  for (const auto set : {gtk_text_view_set_left_margin, gtk_text_view_set_right_margin, gtk_text_view_set_top_margin,
                         gtk_text_view_set_bottom_margin}) {
    set(GTK_TEXT_VIEW(text_), 8);
  }
  gtk_accessible_update_property(GTK_ACCESSIBLE(text_), GTK_ACCESSIBLE_PROPERTY_LABEL, _("Note"), -1);
  GtkWidget* scrolled = gtk_scrolled_window_new();
  gtk_scrolled_window_set_child(GTK_SCROLLED_WINDOW(scrolled), text_);
  gtk_scrolled_window_set_policy(GTK_SCROLLED_WINDOW(scrolled), GTK_POLICY_NEVER, GTK_POLICY_AUTOMATIC);
  gtk_widget_set_size_request(scrolled, 240, 96);
  gtk_widget_add_css_class(scrolled, "card");
  GtkWidget* cancel = gtk_button_new_with_label(_("Cancel"));
  gtk_widget_add_css_class(done_, "suggested-action");
  GtkWidget* buttons = gtk_box_new(GTK_ORIENTATION_HORIZONTAL, 6);
  gtk_box_set_homogeneous(GTK_BOX(buttons), TRUE);
  for (GtkWidget* button : {cancel, done_}) gtk_box_append(GTK_BOX(buttons), button);
  GtkWidget* box = gtk_box_new(GTK_ORIENTATION_VERTICAL, 8);
  for (GtkWidget* child : {scrolled, buttons}) gtk_box_append(GTK_BOX(box), child);
  gtk_popover_set_child(GTK_POPOVER(popover_), box);
  gtk_widget_set_parent(popover_, parent);

  g_signal_connect_swapped(cancel, "clicked", G_CALLBACK(+[](NotePopover* self) { self->giveUp(); }), this);
  g_signal_connect_swapped(done_, "clicked", G_CALLBACK(+[](NotePopover* self) { self->finish(); }), this);
  g_signal_connect_swapped(popover_, "closed", G_CALLBACK(+[](NotePopover* self) { self->closed(); }), this);
  GtkEventController* keys = gtk_event_controller_key_new();
  gtk_event_controller_set_propagation_phase(keys, GTK_PHASE_CAPTURE);
  g_signal_connect(
      keys, "key-pressed",
      G_CALLBACK(+[](GtkEventControllerKey*, guint key, guint, GdkModifierType state, NotePopover* self) -> gboolean {
        if (key == GDK_KEY_Escape) {
          self->giveUp();
        } else if ((state & GDK_CONTROL_MASK) && (key == GDK_KEY_Return || key == GDK_KEY_KP_Enter)) {
          self->finish();
        } else {
          return FALSE;
        }
        return TRUE;
      }),
      this);
  gtk_widget_add_controller(popover_, keys);
}

NotePopover::~NotePopover() {
  leaveWindow();
  g_signal_handlers_disconnect_by_data(popover_, this);
  gtk_widget_unparent(popover_);
}

void NotePopover::ask(const GdkRectangle& place, std::function<void(const std::string&)> written, const std::string& text) {
  finish();
  written_ = std::move(written);
  setText(text);
  gtk_button_set_label(GTK_BUTTON(done_), text.empty() ? _("Add Note") : _("Save Note"));
  place_ = place;
  fitIntoWindow();
  followWindow();
  gtk_popover_popup(GTK_POPOVER(popover_));
  gtk_widget_grab_focus(text_);
}

void NotePopover::followWindow() {
  GtkNative* native = gtk_widget_get_native(gtk_widget_get_parent(popover_));
  if (!native) return;
  window_ = GDK_SURFACE(g_object_ref(gtk_native_get_surface(native)));
  // The window lays its widgets out in a handler of its own, which is older.
  layout_ = g_signal_connect_data(window_, "layout",
                                  G_CALLBACK(+[](GdkSurface*, int, int, NotePopover* self) { self->fitIntoWindow(); }), this,
                                  nullptr, G_CONNECT_AFTER);
}

void NotePopover::leaveWindow() {
  if (!window_) return;
  g_signal_handler_disconnect(window_, layout_);
  g_clear_object(&window_);
}

// The keyboard of a phone takes the lower part of the window as soon as there is something to write, and no popover is moved
// out of its way.
void NotePopover::fitIntoWindow() {
  GtkWidget* parent = gtk_widget_get_parent(popover_);
  GtkWidget* window = GTK_WIDGET(gtk_widget_get_root(parent));
  double x = 0;
  double top = 0;
  if (!window || !gtk_widget_translate_coordinates(parent, window, 0, 0, &x, &top)) return;
  const int height = gtk_widget_get_height(window);
  int needed = 0;
  gtk_widget_measure(popover_, GTK_ORIENTATION_VERTICAL, -1, nullptr, &needed, nullptr, nullptr);
  const int offset = static_cast<int>(top);
  const bool fitsBelow = offset + place_.y + place_.height + needed <= height;
  GdkRectangle pointed = place_;
  if (!fitsBelow) pointed.y = std::min(std::max(place_.y, needed - offset), std::max(height - offset - place_.height, 0));
  GdkRectangle now = {};
  const bool isThere = gtk_popover_get_pointing_to(GTK_POPOVER(popover_), &now) && gdk_rectangle_equal(&now, &pointed);
  const GtkPositionType side = fitsBelow ? GTK_POS_BOTTOM : GTK_POS_TOP;
  // Either would have the window laid out anew each time.
  if (isThere && gtk_popover_get_position(GTK_POPOVER(popover_)) == side) return;
  gtk_popover_set_position(GTK_POPOVER(popover_), side);
  gtk_popover_set_pointing_to(GTK_POPOVER(popover_), &pointed);
}

void NotePopover::giveUp() {
  written_ = nullptr;
  finish();
}

void NotePopover::setText(const std::string& text) {
  gtk_text_buffer_set_text(gtk_text_view_get_buffer(GTK_TEXT_VIEW(text_)), text.c_str(), static_cast<int>(text.size()));
}

void NotePopover::closed() {
  leaveWindow();
  gtk_widget_grab_focus(content_);
  const std::function<void(const std::string&)> written = std::move(written_);
  written_ = nullptr;
  const std::string left = text();
  if (written && !left.empty()) written(left);
}

std::string NotePopover::text() const {
  GtkTextBuffer* buffer = gtk_text_view_get_buffer(GTK_TEXT_VIEW(text_));
  GtkTextIter begin;
  GtkTextIter end;
  gtk_text_buffer_get_bounds(buffer, &begin, &end);
  return takeString(g_strstrip(gtk_text_buffer_get_text(buffer, &begin, &end, FALSE)));
}

}  // namespace vaelo
