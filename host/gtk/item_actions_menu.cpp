// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/gtk/item_actions_menu.h"

#include <algorithm>
#include <iterator>
#include <memory>

#include "host/gtk/focus_return.h"
#include "host/gtk/item_peek.h"
#include "host/gtk/popover_parent.h"
#include "host/gtk/style.h"
#include "host/gtk/touch_size.h"
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

constexpr const char* PeekId = "peek";
/// A phone on its side has no room for more than the menu.
constexpr int PeekFromHeight = 560;
/// What the menu is higher than its rows: its frame, and the separator.
constexpr int MenuFrame = 26;
constexpr const char* SeparatorId = "separator";

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

/// A finger that opened the menu by a long press is what chooses from it.
void makeRowsLarge(GtkWidget* menu) {
  addStyle((".vaelo-item-menu modelbutton { min-height: " + std::to_string(TouchSize) + "px; }").c_str());
  gtk_widget_add_css_class(menu, "vaelo-item-menu");
}

/// A menu goes below its place or above it, and is cut where neither has room for all of it. Then it begins above the place
/// and ends with the window. `height` is the menu's.
GdkRectangle placeWithRoom(int height, GtkWidget* over, GtkWidget* window, const GdkRectangle& at) {
  graphene_point_t origin;
  const graphene_point_t corner = GRAPHENE_POINT_INIT(0, 0);
  if (!gtk_widget_compute_point(over, window, &corner, &origin)) return at;
  const int above = static_cast<int>(origin.y) + at.y;
  const int below = gtk_widget_get_height(window) - above - at.height;
  if (below >= height || above >= height) return at;
  return {at.x, at.y - std::min(above, height - below), at.width, at.height};
}

}  // namespace

void showItemActionsMenu(GtkWidget* over, const GdkRectangle& at, const std::string& path, unsigned available, bool selects,
                         std::function<void(int)> chosen) {
  const auto offered = [available, selects](int entry) {
    if (entry == TagsEntry) return true;
    return entry == SelectEntry ? selects : (available & 1U << entry) != 0;
  };
  GtkWidget* window = GTK_WIDGET(gtk_widget_get_root(over));
  if (!window) return;
  GMenu* menu = g_menu_new();
  const auto append = [menu](const char* label, const char* attribute, GVariant* value) {
    GMenuItem* item = g_menu_item_new(label, nullptr);
    g_menu_item_set_attribute_value(item, attribute, value);
    if (label) g_menu_item_set_attribute(item, G_MENU_ATTRIBUTE_ACTION, "s", "item.act");
    g_menu_append_item(menu, item);
    g_object_unref(item);
  };
  const bool peeks = offered(ItemAction::FirmpressPop) && gtk_widget_get_height(window) >= PeekFromHeight;
  if (peeks) append(nullptr, "custom", g_variant_new_string(PeekId));
  for (const Entry& entry : Entries) {
    if (!offered(entry.action)) continue;
    if (entry.action == ItemAction::Delete) append(nullptr, "custom", g_variant_new_string(SeparatorId));
    append(_(entry.label), G_MENU_ATTRIBUTE_TARGET, g_variant_new_int32(entry.action));
  }
  GtkWidget* popover = gtk_popover_menu_new_from_model(G_MENU_MODEL(menu));
  g_object_unref(menu);
  // That between the sections of a menu comes after it was measured, and the last row would be cut off.
  auto* custom = GTK_POPOVER_MENU(popover);
  if (offered(ItemAction::Delete)) {
    gtk_popover_menu_add_child(custom, gtk_separator_new(GTK_ORIENTATION_HORIZONTAL), SeparatorId);
  }
  if (peeks) gtk_popover_menu_add_child(custom, makeItemPeek(path, "item.act", ItemAction::FirmpressPop), PeekId);
  GSimpleActionGroup* group = g_simple_action_group_new();
  GSimpleAction* act = g_simple_action_new("act", G_VARIANT_TYPE_INT32);
  g_signal_connect_data(
      act, "activate", G_CALLBACK(choose), new Chosen(std::move(chosen)),
      [](gpointer held, GClosure*) { delete static_cast<Chosen*>(held); }, GConnectFlags(0));
  g_action_map_add_action(G_ACTION_MAP(group), G_ACTION(act));
  g_object_unref(act);
  gtk_widget_insert_action_group(popover, "item", G_ACTION_GROUP(group));
  g_object_unref(group);
  setPopoverParent(popover, over);
  // What does not show yet can't be measured.
  const auto rows = static_cast<int>(std::count_if(std::begin(Entries), std::end(Entries),
                                                   [&offered](const Entry& entry) { return offered(entry.action); }));
  const GdkRectangle place = placeWithRoom(rows * TouchSize + (peeks ? PeekRoom : 0) + MenuFrame, over, window, at);
  gtk_popover_set_pointing_to(GTK_POPOVER(popover), &place);
  gtk_popover_set_has_arrow(GTK_POPOVER(popover), FALSE);
  gtk_widget_set_halign(popover, GTK_ALIGN_START);
  returnFocusWhenClosed(popover);
  makeRowsLarge(popover);
  gtk_popover_popup(GTK_POPOVER(popover));
}

}  // namespace vaelo
