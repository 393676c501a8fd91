// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/gtk/preview/note_popover.h"

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
  g_signal_handlers_disconnect_by_data(popover_, this);
  gtk_widget_unparent(popover_);
}

void NotePopover::ask(const GdkRectangle& place, std::function<void(const std::string&)> written, const std::string& text) {
  finish();
  written_ = std::move(written);
  setText(text);
  gtk_button_set_label(GTK_BUTTON(done_), text.empty() ? _("Add Note") : _("Save Note"));
  gtk_popover_set_pointing_to(GTK_POPOVER(popover_), &place);
  gtk_popover_popup(GTK_POPOVER(popover_));
  gtk_widget_grab_focus(text_);
}

void NotePopover::giveUp() {
  written_ = nullptr;
  finish();
}

void NotePopover::setText(const std::string& text) {
  gtk_text_buffer_set_text(gtk_text_view_get_buffer(GTK_TEXT_VIEW(text_)), text.c_str(), static_cast<int>(text.size()));
}

void NotePopover::closed() {
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
