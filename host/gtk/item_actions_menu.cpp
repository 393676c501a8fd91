// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/gtk/item_actions_menu.h"

#include <memory>

#include "host/gtk/focus_return.h"
#include "host/support/texts.h"
#include "platform/ui/document_list_controller_delegate.h"

namespace vaelo {

namespace {

struct Entry {
  int action;
  const char* label;
};

// What a person does most comes first, and what can't be undone last.
constexpr Entry Entries[] = {{ItemAction::FirmpressPop, N_("_Open")},
                             {ItemAction::Share, N_("_Share…")},
                             {ItemAction::Info, N_("_Info")},
                             {ItemAction::Rename, N_("_Rename…")},
                             {TagsEntry, N_("_Tags…")},
                             {ItemAction::Move, N_("_Move…")},
                             {SelectEntry, N_("Se_lect")},
                             {ItemAction::Delete, N_("_Delete…")}};

using Chosen = std::function<void(int)>;

void choose(GSimpleAction*, GVariant* parameter, gpointer data) {
  const int action = g_variant_get_int32(parameter);
  // After the menu is gone, so that what comes next takes its place.
  struct Later {
    Chosen chosen;
    int action;
  };
  g_idle_add_full(
      G_PRIORITY_DEFAULT,
      [](gpointer held) -> gboolean {
        const auto* later = static_cast<Later*>(held);
        later->chosen(later->action);
        return G_SOURCE_REMOVE;
      },
      new Later{*static_cast<Chosen*>(data), action}, [](gpointer held) { delete static_cast<Later*>(held); });
}

}  // namespace

void showItemActionsMenu(GtkWidget* over, const GdkRectangle& at, unsigned available, bool selects,
                         std::function<void(int)> chosen) {
  const auto offered = [available, selects](int entry) {
    if (entry == TagsEntry) return true;
    return entry == SelectEntry ? selects : (available & 1U << entry) != 0;
  };
  GMenu* menu = g_menu_new();
  GMenu* section = g_menu_new();
  for (const Entry& entry : Entries) {
    if (!offered(entry.action)) continue;
    if (entry.action == ItemAction::Delete) {
      g_menu_append_section(menu, nullptr, G_MENU_MODEL(section));
      g_object_unref(section);
      section = g_menu_new();
    }
    GMenuItem* item = g_menu_item_new(_(entry.label), nullptr);
    g_menu_item_set_action_and_target(item, "item.act", "i", entry.action);
    g_menu_append_item(section, item);
    g_object_unref(item);
  }
  g_menu_append_section(menu, nullptr, G_MENU_MODEL(section));
  g_object_unref(section);

  GtkWidget* popover = gtk_popover_menu_new_from_model(G_MENU_MODEL(menu));
  g_object_unref(menu);
  GSimpleActionGroup* group = g_simple_action_group_new();
  GSimpleAction* act = g_simple_action_new("act", G_VARIANT_TYPE_INT32);
  g_signal_connect_data(
      act, "activate", G_CALLBACK(choose), new Chosen(std::move(chosen)),
      [](gpointer held, GClosure*) { delete static_cast<Chosen*>(held); }, GConnectFlags(0));
  g_action_map_add_action(G_ACTION_MAP(group), G_ACTION(act));
  g_object_unref(act);
  gtk_widget_insert_action_group(popover, "item", G_ACTION_GROUP(group));
  g_object_unref(group);
  gtk_widget_set_parent(popover, over);
  gtk_popover_set_pointing_to(GTK_POPOVER(popover), &at);
  gtk_popover_set_has_arrow(GTK_POPOVER(popover), FALSE);
  gtk_widget_set_halign(popover, GTK_ALIGN_START);
  g_signal_connect(popover, "closed", G_CALLBACK(+[](GtkWidget* closed, gpointer) {
                     // Its action may still be on its way.
                     g_idle_add_full(
                         G_PRIORITY_LOW,
                         [](gpointer held) -> gboolean {
                           gtk_widget_unparent(GTK_WIDGET(held));
                           g_object_unref(held);
                           return G_SOURCE_REMOVE;
                         },
                         g_object_ref(closed), nullptr);
                   }),
                   nullptr);
  returnFocusWhenClosed(popover);
  gtk_popover_popup(GTK_POPOVER(popover));
}

}  // namespace vaelo
