// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/gtk/shortcuts_window.h"

#include <adwaita.h>

#include <array>
#include <span>
#include <string>

#include "host/gtk/dialog_size.h"
#include "host/support/glib_ptr.h"
#include "host/support/texts.h"

namespace vaelo {

namespace {

struct Shortcut {
  const char* keys;  ///< as the toolkit writes them, a space between those that mean the same
  const char* title;
};

// The toolkit's names of keys.
constexpr const char* TabKey = "Tab";        // not for people
constexpr const char* EnterKey = "Return";   // not for people
constexpr const char* DeleteKey = "Delete";  // not for people
constexpr const char* HomeKey = "Home";      // not for people
constexpr const char* EndKey = "End";        // not for people

constexpr Shortcut GeneralKeys[] = {{"F10", N_("Main Menu")},
                                    {"<Control>question", N_("Keyboard Shortcuts")},
                                    {"Escape <Alt>Left", N_("Back")},
                                    {TabKey, N_("From the List to the Buttons")},
                                    {"<Control>q", N_("Quit")}};
constexpr Shortcut FolderKeys[] = {{EnterKey, N_("Open")},
                                   {"<Alt>Up", N_("Folder Above")},
                                   {"<Control>f", N_("Search below this folder")},
                                   {"F5 <Control>r", N_("Refresh")},
                                   {"Menu <Shift>F10", N_("Menu of the Item")},
                                   {"F2", N_("Rename")},
                                   {"<Alt>Return", N_("Info")},
                                   {"<Control>m", N_("Move")},
                                   {DeleteKey, N_("Delete")}};
constexpr Shortcut SelectingKeys[] = {
    {"<Control>a", N_("Select All")}, {"space", N_("Select or Unselect")}, {"<Shift>Down", N_("Select a Range")}};
constexpr Shortcut DocumentKeys[] = {{"<Control>f", N_("Find in this document")},
                                     {EnterKey, N_("Find Next")},
                                     {"<Shift>Return", N_("Find Previous")},
                                     {"<Control>plus", N_("Zoom in")},
                                     {"<Control>minus", N_("Zoom out")},
                                     {"<Control>0", N_("Usual Size")},
                                     {"1", N_("Picture in Its Own Size")},
                                     {HomeKey, N_("Beginning")},
                                     {EndKey, N_("End")},
                                     {"<Control>c", N_("Copy")},
                                     {"<Control>z", N_("Undo Mark")}};
constexpr Shortcut MediaKeys[] = {{"space", N_("Play or Pause")}, {"m", N_("Mute")}, {"F11 f", N_("Full Screen")}};
constexpr Shortcut InfoKeys[] = {
    {"<Control>t", N_("Change the Tags")}, {EnterKey, N_("Rename as Typed")}, {"Escape", N_("Keep the Old Name")}};

struct ShortcutGroup {
  const char* title;
  std::span<const Shortcut> shortcuts;
};

constexpr ShortcutGroup ShortcutGroups[] = {{N_("General"), GeneralKeys},      {N_("Folders"), FolderKeys},
                                            {N_("Selecting"), SelectingKeys},  {N_("Documents"), DocumentKeys},
                                            {N_("Sound and Film"), MediaKeys}, {N_("Info"), InfoKeys}};

/// The keys in words, for those who don't see them drawn.
std::string spokenKeys(const char* keys) {
  std::string text;
  char** each = g_strsplit(keys, " ", -1);
  for (char** key = each; *key; ++key) {
    guint value = 0;
    GdkModifierType held{};
    gtk_accelerator_parse(*key, &value, &held);
    if (!text.empty()) text += ", ";
    text += takeString(gtk_accelerator_get_label(value, held));
  }
  g_strfreev(each);
  return text;
}

GtkWidget* makeShortcutRow(const Shortcut& shortcut) {
  GtkWidget* row = adw_action_row_new();
  adw_preferences_row_set_title(ADW_PREFERENCES_ROW(row), _(shortcut.title));
  GtkWidget* keys = gtk_shortcut_label_new(shortcut.keys);
  gtk_widget_set_valign(keys, GTK_ALIGN_CENTER);
  adw_action_row_add_suffix(ADW_ACTION_ROW(row), keys);
  // Drawn keys are no words.
  gtk_accessible_update_state(GTK_ACCESSIBLE(keys), GTK_ACCESSIBLE_STATE_HIDDEN, TRUE, -1);
  gtk_accessible_update_property(GTK_ACCESSIBLE(row), GTK_ACCESSIBLE_PROPERTY_DESCRIPTION, spokenKeys(shortcut.keys).c_str(),
                                 -1);
  return row;
}

}  // namespace

// The toolkit's own window of shortcuts lays them out in columns, which are wider than a phone and don't scroll.
GtkWindow* showShortcutsWindow(GtkWindow* over) {
  GtkWindow* window = GTK_WINDOW(adw_window_new());
  gtk_window_set_transient_for(window, over);
  gtk_window_set_destroy_with_parent(window, TRUE);
  gtk_window_set_modal(window, TRUE);
  gtk_window_set_title(window, _("Keyboard Shortcuts"));
  setDialogSize(window, over, 560);
  GtkWidget* page = adw_preferences_page_new();
  GtkWidget* first = nullptr;
  for (const ShortcutGroup& group : ShortcutGroups) {
    GtkWidget* rows = adw_preferences_group_new();
    adw_preferences_group_set_title(ADW_PREFERENCES_GROUP(rows), _(group.title));
    for (const Shortcut& shortcut : group.shortcuts) {
      GtkWidget* row = makeShortcutRow(shortcut);
      if (!first) first = row;
      adw_preferences_group_add(ADW_PREFERENCES_GROUP(rows), row);
    }
    adw_preferences_page_add(ADW_PREFERENCES_PAGE(page), ADW_PREFERENCES_GROUP(rows));
  }
  gtk_widget_set_vexpand(page, TRUE);
  GtkWidget* box = gtk_box_new(GTK_ORIENTATION_VERTICAL, 0);
  gtk_box_append(GTK_BOX(box), adw_header_bar_new());
  gtk_box_append(GTK_BOX(box), page);
  adw_window_set_content(ADW_WINDOW(window), box);
  GtkEventController* escape = gtk_shortcut_controller_new();
  gtk_shortcut_controller_add_shortcut(
      GTK_SHORTCUT_CONTROLLER(escape),
      gtk_shortcut_new(gtk_shortcut_trigger_parse_string("Escape"), gtk_named_action_new("window.close")));
  gtk_widget_add_controller(GTK_WIDGET(window), escape);
  gtk_window_present(window);
  // From where the arrows go down the list.
  gtk_widget_grab_focus(first);
  return window;
}

}  // namespace vaelo
