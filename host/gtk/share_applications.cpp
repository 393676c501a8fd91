// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/gtk/share_applications.h"

#include <adwaita.h>

#include <algorithm>
#include <memory>
#include <vector>

#include "host/gtk/dialog_size.h"
#include "host/support/glib_ptr.h"
#include "host/support/texts.h"

namespace vaelo {

namespace {

struct Candidate {
  std::string key;  ///< sorts by name as the user's language does
  GRef<GAppInfo> app;
};

std::vector<Candidate> candidates() {
  std::vector<Candidate> found;
  GList* all = g_app_info_get_all();
  for (GList* at = all; at; at = at->next) {
    GRef<GAppInfo> app(G_APP_INFO(at->data));
    const bool takesFiles = g_app_info_supports_files(app.get()) || g_app_info_supports_uris(app.get());
    const char* id = g_app_info_get_id(app.get());
    if (!takesFiles || !g_app_info_should_show(app.get()) || g_strcmp0(id, "com.marrow.VaeloDrive.desktop") == 0) continue;
    found.push_back({takeString(g_utf8_collate_key(g_app_info_get_display_name(app.get()), -1)), std::move(app)});
  }
  g_list_free(all);
  std::sort(found.begin(), found.end(), [](const Candidate& a, const Candidate& b) { return a.key < b.key; });
  return found;
}

/// What a row does; the window goes first.
struct Choice {
  GtkWindow* window;
  GRef<GAppInfo> app;
  std::shared_ptr<std::function<void(GAppInfo*)>> chosen;
};

void rowActivated(AdwActionRow*, gpointer held) {
  const auto& choice = *static_cast<Choice*>(held);
  const GRef<GAppInfo> app(G_APP_INFO(g_object_ref(choice.app.get())));
  const auto chosen = choice.chosen;
  gtk_window_destroy(choice.window);
  (*chosen)(app.get());
}

GtkWidget* makeRow(GtkWindow* window, Candidate& candidate, const std::shared_ptr<std::function<void(GAppInfo*)>>& chosen) {
  GtkWidget* row = adw_action_row_new();
  adw_preferences_row_set_use_markup(ADW_PREFERENCES_ROW(row), FALSE);
  adw_preferences_row_set_title(ADW_PREFERENCES_ROW(row), g_app_info_get_display_name(candidate.app.get()));
  GIcon* icon = g_app_info_get_icon(candidate.app.get());
  GtkWidget* image =
      icon ? gtk_image_new_from_gicon(icon) : gtk_image_new_from_icon_name("application-x-executable-symbolic");
  gtk_image_set_pixel_size(GTK_IMAGE(image), 24);
  adw_action_row_add_prefix(ADW_ACTION_ROW(row), image);
  gtk_list_box_row_set_activatable(GTK_LIST_BOX_ROW(row), TRUE);
  g_signal_connect_data(
      row, "activated", G_CALLBACK(rowActivated), new Choice{window, std::move(candidate.app), chosen},
      [](gpointer held, GClosure*) { delete static_cast<Choice*>(held); }, GConnectFlags(0));
  return row;
}

GtkWidget* makeList(GtkWindow* window, std::function<void(GAppInfo*)> chosen) {
  std::vector<Candidate> all = candidates();
  if (all.empty()) {
    GtkWidget* nothing = adw_status_page_new();
    adw_status_page_set_title(ADW_STATUS_PAGE(nothing), _("No Applications"));
    adw_status_page_set_description(ADW_STATUS_PAGE(nothing), _("No installed application opens documents."));
    return nothing;
  }
  GtkWidget* list = gtk_list_box_new();
  gtk_list_box_set_selection_mode(GTK_LIST_BOX(list), GTK_SELECTION_NONE);
  gtk_widget_add_css_class(list, "boxed-list");
  gtk_widget_set_valign(list, GTK_ALIGN_START);
  gtk_accessible_update_property(GTK_ACCESSIBLE(list), GTK_ACCESSIBLE_PROPERTY_LABEL, _("Applications"), -1);
  for (auto margin :
       {gtk_widget_set_margin_top, gtk_widget_set_margin_bottom, gtk_widget_set_margin_start, gtk_widget_set_margin_end}) {
    margin(list, 12);
  }
  const auto shared = std::make_shared<std::function<void(GAppInfo*)>>(std::move(chosen));
  for (Candidate& candidate : all) gtk_list_box_append(GTK_LIST_BOX(list), makeRow(window, candidate, shared));
  return list;
}

}  // namespace

void chooseApplicationFor(const std::string& itemName, GtkWindow* over, std::function<void(GAppInfo*)> chosen) {
  GtkWidget* window = adw_window_new();
  gtk_window_set_title(GTK_WINDOW(window), _("Open With"));
  gtk_window_set_transient_for(GTK_WINDOW(window), over);
  gtk_window_set_modal(GTK_WINDOW(window), TRUE);
  gtk_window_set_destroy_with_parent(GTK_WINDOW(window), TRUE);
  setDialogSize(GTK_WINDOW(window), over, 480);
  GtkEventController* keys = gtk_shortcut_controller_new();
  gtk_shortcut_controller_add_shortcut(
      GTK_SHORTCUT_CONTROLLER(keys),
      gtk_shortcut_new(gtk_shortcut_trigger_parse_string("Escape"), gtk_named_action_new("window.close")));
  gtk_widget_add_controller(window, keys);

  GtkWidget* header = adw_header_bar_new();
  adw_header_bar_set_title_widget(ADW_HEADER_BAR(header), adw_window_title_new(_("Open With"), itemName.c_str()));
  GtkWidget* scrolled = gtk_scrolled_window_new();
  gtk_scrolled_window_set_policy(GTK_SCROLLED_WINDOW(scrolled), GTK_POLICY_NEVER, GTK_POLICY_AUTOMATIC);
  gtk_scrolled_window_set_child(GTK_SCROLLED_WINDOW(scrolled), makeList(GTK_WINDOW(window), std::move(chosen)));
  gtk_widget_set_vexpand(scrolled, TRUE);
  GtkWidget* box = gtk_box_new(GTK_ORIENTATION_VERTICAL, 0);
  gtk_box_append(GTK_BOX(box), header);
  gtk_box_append(GTK_BOX(box), scrolled);
  adw_window_set_content(ADW_WINDOW(window), box);
  gtk_window_present(GTK_WINDOW(window));
}

}  // namespace vaelo
