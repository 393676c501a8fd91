// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/gtk/preview/document_buttons.h"

#include <algorithm>

#include "host/gtk/menu_tooltip.h"
#include "host/gtk/pango_graphics.h"
#include "host/gtk/preview/find_bar.h"
#include "host/support/glib_ptr.h"
#include "host/support/texts.h"

namespace vaelo {

namespace {
constexpr int NarrowBelow = 480;  // pixels, at letters of the usual size
}

DocumentButtons::~DocumentButtons() {
  g_clear_handle_id(&idle_, g_source_remove);
  g_clear_weak_pointer(&both_);
  g_clear_weak_pointer(&menu_);
}

GtkWidget* DocumentButtons::make() {
  GtkWidget* both = gtk_box_new(GTK_ORIENTATION_HORIZONTAL, 6);
  for (GtkWidget* button : {bar_.makeToggle(), makeFindButton(find_, data_)}) gtk_box_append(GTK_BOX(both), button);
  GtkWidget* menu = makeMenu();
  g_set_weak_pointer(&both_, both);
  g_set_weak_pointer(&menu_, menu);
  show();
  GtkWidget* box = gtk_box_new(GTK_ORIENTATION_HORIZONTAL, 0);
  for (GtkWidget* child : {both, menu}) gtk_box_append(GTK_BOX(box), child);
  return box;
}

GtkWidget* DocumentButtons::makeMenu() {
  const GRef<GSimpleAction> find(g_simple_action_new("find", nullptr));
  g_signal_connect_swapped(find.get(), "activate", find_, data_);
  const GRef<GSimpleActionGroup> actions(g_simple_action_group_new());
  g_action_map_add_action(G_ACTION_MAP(actions.get()), G_ACTION(find.get()));
  const GRef<GPropertyAction> markup(g_property_action_new("markup", bar_.widget(), "reveal-child"));
  g_action_map_add_action(G_ACTION_MAP(actions.get()), G_ACTION(markup.get()));
  const GRef<GMenu> items(g_menu_new());
  g_menu_append(items.get(), _("_Find in This Document"), "document.find");
  g_menu_append(items.get(), _("_Markup"), "document.markup");
  GtkWidget* menu = gtk_menu_button_new();
  gtk_menu_button_set_icon_name(GTK_MENU_BUTTON(menu), "view-more-symbolic");
  gtk_menu_button_set_menu_model(GTK_MENU_BUTTON(menu), G_MENU_MODEL(items.get()));
  gtk_widget_insert_action_group(menu, "document", G_ACTION_GROUP(actions.get()));
  setTooltipWhileClosed(GTK_MENU_BUTTON(menu), _("Find and Markup"));
  gtk_accessible_update_property(GTK_ACCESSIBLE(menu), GTK_ACCESSIBLE_PROPERTY_LABEL, _("Find and Markup"), -1);
  return menu;
}

// What a widget's size decides on can't change another's while sizes are given.
void DocumentButtons::fit(int width) {
  const bool narrow = width > 0 && width < NarrowBelow * std::max(textScale(), 1.0);
  if (narrow == narrow_) return;
  narrow_ = narrow;
  if (idle_) return;
  idle_ = g_idle_add(
      +[](gpointer data) -> gboolean {
        auto* self = static_cast<DocumentButtons*>(data);
        self->idle_ = 0;
        self->show();
        return G_SOURCE_REMOVE;
      },
      this);
}

void DocumentButtons::show() {
  if (both_) gtk_widget_set_visible(both_, !narrow_);
  if (menu_) gtk_widget_set_visible(menu_, narrow_);
}

}  // namespace vaelo
