// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/gtk/bar_item_widget.h"

#include <memory>
#include <string_view>

#include "host/gtk/framed_view.h"
#include "host/gtk/pango_graphics.h"
#include "host/support/texts.h"
#include "platform/ui/button.h"

namespace vaelo {

namespace {

struct SystemLook {
  const char* icon;
  const char* label;
};

SystemLook lookOf(SystemItem item) {
  switch (item) {
    case SystemItem::Cancel:
      return {nullptr, _("Cancel")};
    case SystemItem::Done:
      return {nullptr, _("Done")};
    case SystemItem::Trash:
      return {"user-trash-symbolic", _("Delete")};
    case SystemItem::Action:
      return {"emblem-shared-symbolic", _("Share")};
    case SystemItem::Organize:
      return {"folder-symbolic", _("Move")};
    case SystemItem::FlexibleSpace:
    case SystemItem::FixedSpace:
      break;
  }
  return {nullptr, nullptr};
}

constexpr const char* ItemKey = "vaelo-bar-item";

/// Keeps a model's signal connected for as long as a widget lives.
void keepWithWidget(GtkWidget* widget, std::shared_ptr<void> token) {
  g_object_set_data_full(G_OBJECT(widget), "vaelo-token", new std::shared_ptr<void>(std::move(token)),
                         [](gpointer held) { delete static_cast<std::shared_ptr<void>*>(held); });
}

}  // namespace

GtkWidget* makeBarItemWidget(const BarButtonItemRef& item, const char* icon) {
  const std::optional<SystemItem>& system = item->systemItem();
  if (system == SystemItem::FlexibleSpace || system == SystemItem::FixedSpace) {
    GtkWidget* space = gtk_box_new(GTK_ORIENTATION_HORIZONTAL, 0);
    gtk_widget_set_hexpand(space, system == SystemItem::FlexibleSpace);
    if (system == SystemItem::FixedSpace) gtk_widget_set_size_request(space, 12, -1);
    return space;
  }
  if (item->customView() && !std::dynamic_pointer_cast<Button>(item->customView())) {
    return makeFramedView(item->customView());
  }

  GtkWidget* button = gtk_button_new();
  // A text that is edited would end at the press and be taken, before Cancel is heard.
  gtk_widget_set_focus_on_click(button, FALSE);
  g_object_set_data(G_OBJECT(button), ItemKey, item.get());
  const SystemLook look = system ? lookOf(*system) : SystemLook{icon, icon ? item->title().c_str() : nullptr};
  if (look.icon) {
    gtk_button_set_icon_name(GTK_BUTTON(button), look.icon);
    gtk_widget_set_tooltip_text(button, look.label);
    gtk_accessible_update_property(GTK_ACCESSIBLE(button), GTK_ACCESSIBLE_PROPERTY_LABEL, look.label, -1);
  }
  const auto show = [button, look, weak = std::weak_ptr(item)] {
    const BarButtonItemRef shown = weak.lock();
    if (!shown) return;
    gtk_widget_set_sensitive(button, shown->enabled());
    const auto* custom = dynamic_cast<const Button*>(shown->customView().get());
    const std::string& title = custom ? custom->title() : shown->title();
    if (look.icon) return;
    gtk_button_set_label(GTK_BUTTON(button), look.label ? look.label : title.c_str());
    // Where large letters leave no room beside the other buttons. A word of a script without spaces can be split anywhere,
    // and a header bar takes the narrowest shape of what fits its height.
    GtkLabel* label = GTK_LABEL(gtk_button_get_child(GTK_BUTTON(button)));
    gtk_label_set_wrap(label,
                       textScale() > 1 || std::string_view(gtk_label_get_text(label)).find(' ') != std::string_view::npos);
    gtk_label_set_justify(label, GTK_JUSTIFY_CENTER);
  };
  show();
  keepWithWidget(button, item->changed().connect([show](BarButtonItem&) { show(); }));
  g_signal_connect_data(
      button, "clicked", G_CALLBACK(+[](GtkButton*, gpointer held) {
        if (const BarButtonItemRef pressed = static_cast<std::weak_ptr<BarButtonItem>*>(held)->lock()) pressed->press();
      }),
      new std::weak_ptr<BarButtonItem>(item),
      [](gpointer held, GClosure*) { delete static_cast<std::weak_ptr<BarButtonItem>*>(held); }, GConnectFlags(0));
  return button;
}

GtkWidget* findBarItemWidget(GtkWidget* root, const BarButtonItem& item) {
  if (!gtk_widget_get_mapped(root)) return nullptr;
  if (g_object_get_data(G_OBJECT(root), ItemKey) == &item) return root;
  for (GtkWidget* child = gtk_widget_get_first_child(root); child; child = gtk_widget_get_next_sibling(child)) {
    if (GtkWidget* found = findBarItemWidget(child, item)) return found;
  }
  return nullptr;
}

}  // namespace vaelo
