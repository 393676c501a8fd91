// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/gtk/mirror/mirrored_button.h"

#include "host/gtk/mirrored_text.h"

namespace vaelo {

MirroredButton::MirroredButton(Button& button)
    : model_(button), button_(GTK_WIDGET(g_object_ref_sink(gtk_button_new()))), title_(gtk_label_new(nullptr)) {
  gtk_label_set_ellipsize(GTK_LABEL(title_), PANGO_ELLIPSIZE_END);
  gtk_button_set_child(GTK_BUTTON(button_), title_);
  gtk_widget_add_css_class(button_, "flat");
  g_signal_connect_swapped(button_, "clicked", G_CALLBACK(+[](MirroredButton* self) {
                             const auto kept = self->model_.shared_from_this();
                             self->model_.sendActions(ControlEvent::TouchUpInside);
                           }),
                           this);
  update();
}

MirroredButton::~MirroredButton() {
  g_signal_handlers_disconnect_by_data(button_, this);
  g_object_unref(button_);
}

void MirroredButton::update() {
  gtk_label_set_text(GTK_LABEL(title_), model_.title().c_str());
  PangoAttrList* attributes = attributesOf(model_.titleLabel()->font());
  gtk_label_set_attributes(GTK_LABEL(title_), attributes);
  pango_attr_list_unref(attributes);
  gtk_widget_set_sensitive(button_, model_.enabled());
}

}  // namespace vaelo
