// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/gtk/preview/link_popover.h"

#include <algorithm>
#include <array>

#include "host/gtk/preview/popover_text.h"
#include "host/support/glib_ptr.h"
#include "host/support/texts.h"

namespace vaelo {

LinkPopover::LinkPopover(GtkWidget* parent, GtkWidget* content)
    : content_(content),
      popover_(gtk_popover_new()),
      label_(makePopoverText()),
      open_(gtk_button_new_with_label(_("Open Link"))) {
  GtkWidget* box = gtk_box_new(GTK_ORIENTATION_VERTICAL, 8);
  for (GtkWidget* child : {scrolledPopoverText(label_), open_}) gtk_box_append(GTK_BOX(box), child);
  gtk_popover_set_child(GTK_POPOVER(popover_), box);
  gtk_widget_set_parent(popover_, parent);
  g_signal_connect_swapped(open_, "clicked", G_CALLBACK(+[](LinkPopover* self) { self->open(); }), this);
  g_signal_connect_swapped(popover_, "closed", G_CALLBACK(gtk_widget_grab_focus), content_);
}

LinkPopover::~LinkPopover() {
  g_signal_handlers_disconnect_by_data(popover_, content_);
  g_signal_handlers_disconnect_by_data(open_, this);
  gtk_widget_unparent(popover_);
}

void LinkPopover::showNote(const GdkRectangle& place, const std::string& text) { show(place, text, false); }

// A document may be hostile: other schemes could start what the user never meant to.
void LinkPopover::showAddress(const GdkRectangle& place, const std::string& address) {
  constexpr std::array schemes = {"http", "https", "mailto"};
  const std::string scheme = takeString(g_uri_parse_scheme(address.c_str()));
  const bool mayOpen = std::any_of(schemes.begin(), schemes.end(),
                                   [&](const char* each) { return g_ascii_strcasecmp(each, scheme.c_str()) == 0; });
  show(place, address, mayOpen);
}

void LinkPopover::show(const GdkRectangle& place, const std::string& text, bool mayOpen) {
  gtk_label_set_text(GTK_LABEL(label_), text.c_str());
  gtk_widget_set_visible(open_, mayOpen);
  gtk_popover_set_pointing_to(GTK_POPOVER(popover_), &place);
  gtk_popover_popup(GTK_POPOVER(popover_));
  if (mayOpen) gtk_widget_grab_focus(open_);
}

void LinkPopover::open() {
  gtk_popover_popdown(GTK_POPOVER(popover_));
  GtkRoot* root = gtk_widget_get_root(popover_);
  gtk_show_uri(GTK_IS_WINDOW(root) ? GTK_WINDOW(root) : nullptr, text().c_str(), GDK_CURRENT_TIME);
}

}  // namespace vaelo
