// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/gtk/preview/mark_popover.h"

#include "host/gtk/preview/popover_text.h"
#include "host/support/texts.h"

namespace vaelo {

namespace {

const char* nameOf(PageMark::Kind kind) {
  switch (kind) {
    case PageMark::Kind::Highlight:
      return _("Highlighted Text");
    case PageMark::Kind::Ink:
      return _("Drawing");
    case PageMark::Kind::Note:
      return _("Note");
  }
  return "";
}

}  // namespace

MarkPopover::MarkPopover(GtkWidget* parent, GtkWidget* content)
    : content_(content),
      popover_(gtk_popover_new()),
      label_(makePopoverText()),
      edit_(gtk_button_new_with_label(_("Edit Note"))),
      remove_(gtk_button_new_with_label(_("Remove"))) {
  gtk_widget_add_css_class(remove_, "destructive-action");
  GtkWidget* buttons = gtk_box_new(GTK_ORIENTATION_HORIZONTAL, 6);
  gtk_box_set_homogeneous(GTK_BOX(buttons), TRUE);
  for (GtkWidget* button : {edit_, remove_}) {
    gtk_widget_set_hexpand(button, TRUE);
    gtk_box_append(GTK_BOX(buttons), button);
  }
  GtkWidget* box = gtk_box_new(GTK_ORIENTATION_VERTICAL, 8);
  for (GtkWidget* child : {scrolledPopoverText(label_), buttons}) gtk_box_append(GTK_BOX(box), child);
  gtk_popover_set_child(GTK_POPOVER(popover_), box);
  gtk_widget_set_parent(popover_, parent);
  g_signal_connect_swapped(edit_, "clicked", G_CALLBACK(+[](MarkPopover* self) { self->edit(); }), this);
  g_signal_connect_swapped(remove_, "clicked", G_CALLBACK(+[](MarkPopover* self) { self->remove(); }), this);
  g_signal_connect_swapped(popover_, "closed", G_CALLBACK(gtk_widget_grab_focus), content_);
}

MarkPopover::~MarkPopover() {
  g_signal_handlers_disconnect_by_data(popover_, content_);
  for (GtkWidget* button : {edit_, remove_}) g_signal_handlers_disconnect_by_data(button, this);
  gtk_widget_unparent(popover_);
}

void MarkPopover::show(const GdkRectangle& place, const PageMark& mark, Events events) {
  events_ = std::move(events);
  gtk_label_set_text(GTK_LABEL(label_), mark.text.empty() ? nameOf(mark.kind) : mark.text.c_str());
  gtk_widget_set_visible(edit_, mark.kind == PageMark::Kind::Note && events_.edit);
  gtk_popover_set_pointing_to(GTK_POPOVER(popover_), &place);
  gtk_popover_popup(GTK_POPOVER(popover_));
  gtk_widget_grab_focus(mayEdit() ? edit_ : remove_);
  gtk_label_select_region(GTK_LABEL(label_), 0, 0);  // which a text that had the focus before is
}

void MarkPopover::finish(const std::function<void()>& event) {
  const std::function<void()> called = event;
  events_ = {};
  close();
  if (called) called();
}

}  // namespace vaelo
