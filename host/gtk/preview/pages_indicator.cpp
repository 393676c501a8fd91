// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/gtk/preview/pages_indicator.h"

#include <string>

#include "host/gtk/menu_tooltip.h"
#include "host/support/texts.h"

namespace vaelo {

PagesIndicator::PagesIndicator(std::function<void(int)> chosen)
    : chosen_(std::move(chosen)),
      button_(GTK_WIDGET(g_object_ref_sink(gtk_menu_button_new()))),
      popover_(gtk_popover_new()),
      entry_(gtk_spin_button_new_with_range(1, 2, 1)) {
  gtk_widget_add_css_class(button_, "osd");
  gtk_widget_add_css_class(button_, "numeric");
  gtk_widget_set_halign(button_, GTK_ALIGN_CENTER);
  gtk_widget_set_valign(button_, GTK_ALIGN_END);
  gtk_widget_set_margin_bottom(button_, 12);
  gtk_menu_button_set_direction(GTK_MENU_BUTTON(button_), GTK_ARROW_UP);
  gtk_widget_set_visible(button_, FALSE);

  GtkWidget* label = gtk_label_new(_("Page"));
  GtkWidget* go = gtk_button_new_with_label(_("Go"));
  gtk_widget_add_css_class(go, "suggested-action");
  gtk_accessible_update_property(GTK_ACCESSIBLE(entry_), GTK_ACCESSIBLE_PROPERTY_LABEL, _("Page to go to"), -1);
  gtk_editable_set_width_chars(GTK_EDITABLE(entry_), 5);
  GtkWidget* box = gtk_box_new(GTK_ORIENTATION_HORIZONTAL, 6);
  for (GtkWidget* child : {label, entry_, go}) gtk_box_append(GTK_BOX(box), child);
  gtk_popover_set_child(GTK_POPOVER(popover_), box);
  gtk_menu_button_set_popover(GTK_MENU_BUTTON(button_), popover_);
  setTooltipWhileClosed(GTK_MENU_BUTTON(button_), _("Go to Page"));
  g_signal_connect_swapped(go, "clicked", G_CALLBACK(+[](PagesIndicator* self) { self->activated(); }), this);
  // A spin button's own signal comes from the text inside of it.
  g_signal_connect_swapped(gtk_editable_get_delegate(GTK_EDITABLE(entry_)), "activate",
                           G_CALLBACK(+[](PagesIndicator* self) { self->activated(); }), this);
  g_signal_connect_swapped(popover_, "show", G_CALLBACK(+[](PagesIndicator* self) {
                             gtk_spin_button_set_value(GTK_SPIN_BUTTON(self->entry_), self->page_ + 1);
                             gtk_widget_grab_focus(self->entry_);
                           }),
                           this);
}

PagesIndicator::~PagesIndicator() {
  gtk_menu_button_set_popover(GTK_MENU_BUTTON(button_), nullptr);
  g_object_unref(button_);
}

void PagesIndicator::activated() {
  gtk_spin_button_update(GTK_SPIN_BUTTON(entry_));
  const int page = gtk_spin_button_get_value_as_int(GTK_SPIN_BUTTON(entry_)) - 1;
  gtk_popover_popdown(GTK_POPOVER(popover_));
  chosen_(page);
}

void PagesIndicator::show(int page, int count) {
  if (page == page_ && count == count_) return;
  page_ = page;
  count_ = count;
  const std::string text = filled(_("%s of %s"), {numberText(page + 1), numberText(count)});
  gtk_menu_button_set_label(GTK_MENU_BUTTON(button_), text.c_str());
  gtk_accessible_update_property(GTK_ACCESSIBLE(button_), GTK_ACCESSIBLE_PROPERTY_LABEL,
                                 filled(_("Page %s of %s"), {numberText(page + 1), numberText(count)}).c_str(), -1);
  gtk_spin_button_set_range(GTK_SPIN_BUTTON(entry_), 1, count);
  gtk_widget_set_visible(button_, count > 1);
}

}  // namespace vaelo
