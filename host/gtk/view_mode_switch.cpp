// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/gtk/view_mode_switch.h"

#include <utility>

#include "host/drive/variant.h"
#include "host/support/texts.h"

namespace vaelo {

namespace {

void showNextMode(GtkButton* button, GActionGroup* actions) {
  const Variant state(g_action_group_get_action_state(actions, "grid"));
  const bool grid = g_variant_get_boolean(state.get());
  const char* label = grid ? _("View as list") : _("View as grid");
  gtk_button_set_icon_name(button, grid ? "view-list-symbolic" : "view-grid-symbolic");
  gtk_widget_set_tooltip_text(GTK_WIDGET(button), label);
  gtk_accessible_update_property(GTK_ACCESSIBLE(button), GTK_ACCESSIBLE_PROPERTY_LABEL, label, -1);
}

}  // namespace

ViewModeSwitch::ViewModeSwitch(std::function<void(bool grid)> chosen)
    : chosen_(std::move(chosen)),
      grid_(g_simple_action_new_stateful("grid", nullptr, g_variant_new_boolean(FALSE))),
      actions_(g_simple_action_group_new()) {
  g_signal_connect(grid_.get(), "change-state",
                   G_CALLBACK(+[](GSimpleAction* action, GVariant* state, ViewModeSwitch* self) {
                     g_simple_action_set_state(action, state);
                     self->chosen_(g_variant_get_boolean(state));
                   }),
                   this);
  g_action_map_add_action(G_ACTION_MAP(actions_.get()), G_ACTION(grid_.get()));
}

ViewModeSwitch::~ViewModeSwitch() { g_signal_handlers_disconnect_by_data(grid_.get(), this); }

GtkWidget* ViewModeSwitch::makeButton() const {
  GtkWidget* button = gtk_button_new();
  showNextMode(GTK_BUTTON(button), actions());
  g_signal_connect_object(
      actions_.get(), "action-state-changed::grid",
      G_CALLBACK(+[](GActionGroup* actions, const char*, GVariant*, GtkButton* shown) { showNextMode(shown, actions); }),
      button, GConnectFlags(0));
  g_signal_connect_object(button, "clicked", G_CALLBACK(+[](GtkButton*, GActionGroup* actions) {
                            g_action_group_activate_action(actions, "grid", nullptr);
                          }),
                          actions_.get(), GConnectFlags(0));
  return button;
}

}  // namespace vaelo
