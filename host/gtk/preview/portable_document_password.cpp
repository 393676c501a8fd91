// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/gtk/preview/portable_document_password.h"

#include "host/support/texts.h"

namespace vaelo {

PortableDocumentPassword::PortableDocumentPassword(std::function<void(const std::string&)> entered)
    : entered_(std::move(entered)),
      page_(GTK_WIDGET(g_object_ref_sink(adw_status_page_new()))),
      entry_(gtk_password_entry_new()),
      wrong_(gtk_label_new(_("This password is not the right one."))) {
  adw_status_page_set_icon_name(ADW_STATUS_PAGE(page_), "channel-secure-symbolic");
  adw_status_page_set_title(ADW_STATUS_PAGE(page_), _("Protected Document"));
  adw_status_page_set_description(ADW_STATUS_PAGE(page_), _("This document is protected by a password."));
  gtk_password_entry_set_show_peek_icon(GTK_PASSWORD_ENTRY(entry_), TRUE);
  g_object_set(entry_, "placeholder-text", _("Password"), nullptr);
  gtk_accessible_update_property(GTK_ACCESSIBLE(entry_), GTK_ACCESSIBLE_PROPERTY_LABEL, _("Password"), -1);
  gtk_label_set_wrap(GTK_LABEL(wrong_), TRUE);
  gtk_widget_add_css_class(wrong_, "error");
  gtk_widget_set_visible(wrong_, FALSE);
  GtkWidget* open = gtk_button_new_with_label(_("Open"));
  gtk_widget_add_css_class(open, "pill");
  gtk_widget_add_css_class(open, "suggested-action");
  gtk_widget_set_halign(open, GTK_ALIGN_CENTER);
  GtkWidget* box = gtk_box_new(GTK_ORIENTATION_VERTICAL, 12);
  for (GtkWidget* child : {entry_, wrong_, open}) gtk_box_append(GTK_BOX(box), child);
  GtkWidget* clamp = adw_clamp_new();
  adw_clamp_set_maximum_size(ADW_CLAMP(clamp), 300);
  adw_clamp_set_child(ADW_CLAMP(clamp), box);
  adw_status_page_set_child(ADW_STATUS_PAGE(page_), clamp);
  g_signal_connect_swapped(open, "clicked", G_CALLBACK(+[](PortableDocumentPassword* self) { self->activated(); }), this);
  g_signal_connect_swapped(entry_, "activate", G_CALLBACK(+[](PortableDocumentPassword* self) { self->activated(); }), this);
}

PortableDocumentPassword::~PortableDocumentPassword() {
  adw_status_page_set_child(ADW_STATUS_PAGE(page_), nullptr);
  g_object_unref(page_);
}

void PortableDocumentPassword::activated() {
  const std::string password = gtk_editable_get_text(GTK_EDITABLE(entry_));
  gtk_widget_set_visible(wrong_, FALSE);
  if (!password.empty()) entered_(password);
}

void PortableDocumentPassword::refuse() {
  gtk_widget_set_visible(wrong_, TRUE);
  gtk_editable_select_region(GTK_EDITABLE(entry_), 0, -1);
  gtk_widget_grab_focus(entry_);
}

}  // namespace vaelo
