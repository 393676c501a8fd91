// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/gtk/share_sheet.h"

#include <adwaita.h>

#include <memory>

#include "host/support/glib_ptr.h"
#include "host/support/texts.h"
#include "platform/platform.h"

namespace vaelo {

namespace {

constexpr const char* RowsKey = "vaelo-share-rows";

using Callback = std::function<void()>;

void deleteCallback(gpointer held, GClosure*) { delete static_cast<Callback*>(held); }

std::string factsOf(const SharedItem& item) {
  const std::string kind = takeString(g_content_type_get_description(item.contentType.c_str()));
  if (item.folder) return kind;
  return kind + " · " + Platform::current().formatting.byteCount(item.size, ByteCountStyle::File);
}

GtkWidget* makeText(const std::string& text, const char* style) {
  GtkWidget* label = gtk_label_new(text.c_str());
  gtk_label_set_xalign(GTK_LABEL(label), 0);
  gtk_widget_add_css_class(label, style);
  return label;
}

GtkWidget* makeHeader(const SharedItem& item, Callback closed) {
  GtkWidget* header = gtk_box_new(GTK_ORIENTATION_HORIZONTAL, 12);
  const GRef<GIcon> icon(g_content_type_get_icon(item.contentType.c_str()));
  GtkWidget* image = gtk_image_new_from_gicon(icon.get());
  gtk_image_set_pixel_size(GTK_IMAGE(image), 40);
  gtk_accessible_update_state(GTK_ACCESSIBLE(image), GTK_ACCESSIBLE_STATE_HIDDEN, TRUE, -1);
  gtk_box_append(GTK_BOX(header), image);
  GtkWidget* texts = gtk_box_new(GTK_ORIENTATION_VERTICAL, 0);
  gtk_widget_set_hexpand(texts, TRUE);
  gtk_widget_set_valign(texts, GTK_ALIGN_CENTER);
  GtkWidget* name = makeText(item.name, "heading");
  gtk_label_set_ellipsize(GTK_LABEL(name), PANGO_ELLIPSIZE_MIDDLE);
  gtk_box_append(GTK_BOX(texts), name);
  GtkWidget* facts = makeText(factsOf(item), "dim-label");
  gtk_label_set_ellipsize(GTK_LABEL(facts), PANGO_ELLIPSIZE_END);
  gtk_label_set_wrap(GTK_LABEL(facts), TRUE);
  gtk_label_set_lines(GTK_LABEL(facts), 3);
  gtk_box_append(GTK_BOX(texts), facts);
  gtk_box_append(GTK_BOX(header), texts);
  if (closed) {
    GtkWidget* close = gtk_button_new_from_icon_name("window-close-symbolic");
    gtk_widget_add_css_class(close, "circular");
    gtk_widget_set_valign(close, GTK_ALIGN_CENTER);
    gtk_widget_set_size_request(close, 44, 44);
    gtk_widget_set_tooltip_text(close, _("Close Sheet"));
    gtk_accessible_update_property(GTK_ACCESSIBLE(close), GTK_ACCESSIBLE_PROPERTY_LABEL, _("Close Sheet"), -1);
    g_signal_connect_data(close, "clicked",
                          G_CALLBACK(+[](GtkButton*, gpointer held) { (*static_cast<Callback*>(held))(); }),
                          new Callback(std::move(closed)), deleteCallback, GConnectFlags(0));
    gtk_box_append(GTK_BOX(header), close);
  }
  return header;
}

GtkWidget* makeSheetRow(ShareRow& row) {
  GtkWidget* widget = adw_action_row_new();
  adw_preferences_row_set_use_markup(ADW_PREFERENCES_ROW(widget), FALSE);
  adw_preferences_row_set_title(ADW_PREFERENCES_ROW(widget), row.title.c_str());
  GtkWidget* image = row.icon ? gtk_image_new_from_gicon(row.icon) : gtk_image_new_from_icon_name(row.iconName.c_str());
  gtk_image_set_pixel_size(GTK_IMAGE(image), row.icon ? 24 : 16);
  gtk_widget_set_size_request(image, 24, 24);
  adw_action_row_add_prefix(ADW_ACTION_ROW(widget), image);
  gtk_list_box_row_set_activatable(GTK_LIST_BOX_ROW(widget), TRUE);
  gtk_widget_set_sensitive(widget, row.enabled);
  g_signal_connect_data(widget, "activated", G_CALLBACK(+[](AdwActionRow*, gpointer held) {
                          // A copy, since what it does may end the row.
                          const Callback chosen = *static_cast<Callback*>(held);
                          chosen();
                        }),
                        new Callback(std::move(row.chosen)), deleteCallback, GConnectFlags(0));
  return widget;
}

}  // namespace

GtkWidget* makeShareSheet(const SharedItem& item, const std::string& notice, std::vector<ShareRow> rows, int mostHeight,
                          Callback closed) {
  GtkWidget* box = gtk_box_new(GTK_ORIENTATION_VERTICAL, 12);
  for (auto margin :
       {gtk_widget_set_margin_top, gtk_widget_set_margin_bottom, gtk_widget_set_margin_start, gtk_widget_set_margin_end}) {
    margin(box, 12);
  }
  gtk_box_append(GTK_BOX(box), makeHeader(item, std::move(closed)));
  if (!notice.empty()) {
    GtkWidget* text = makeText(notice, "body");
    gtk_label_set_wrap(GTK_LABEL(text), TRUE);
    gtk_label_set_width_chars(GTK_LABEL(text), 30);
    gtk_label_set_max_width_chars(GTK_LABEL(text), 40);
    gtk_box_append(GTK_BOX(box), text);
  }
  GtkWidget* list = gtk_list_box_new();
  gtk_list_box_set_selection_mode(GTK_LIST_BOX(list), GTK_SELECTION_NONE);
  gtk_widget_add_css_class(list, "boxed-list");
  const std::string label = filled(_("Share %s"), {item.name});
  gtk_accessible_update_property(GTK_ACCESSIBLE(list), GTK_ACCESSIBLE_PROPERTY_LABEL, label.c_str(), -1);
  for (ShareRow& row : rows) gtk_list_box_append(GTK_LIST_BOX(list), makeSheetRow(row));
  gtk_box_append(GTK_BOX(box), list);

  GtkWidget* scrolled = gtk_scrolled_window_new();
  gtk_scrolled_window_set_policy(GTK_SCROLLED_WINDOW(scrolled), GTK_POLICY_NEVER, GTK_POLICY_AUTOMATIC);
  gtk_scrolled_window_set_propagate_natural_height(GTK_SCROLLED_WINDOW(scrolled), TRUE);
  gtk_scrolled_window_set_max_content_height(GTK_SCROLLED_WINDOW(scrolled), mostHeight);
  gtk_widget_set_size_request(scrolled, 340, -1);
  gtk_scrolled_window_set_child(GTK_SCROLLED_WINDOW(scrolled), box);
  g_object_set_data(G_OBJECT(scrolled), RowsKey, list);
  return scrolled;
}

void focusFirstShareRow(GtkWidget* sheet) {
  gtk_widget_child_focus(static_cast<GtkWidget*>(g_object_get_data(G_OBJECT(sheet), RowsKey)), GTK_DIR_TAB_FORWARD);
}

}  // namespace vaelo
