// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/gtk/mirror/mirrored_name.h"

#include <cmath>

#include "host/gtk/mirrored_text.h"
#include "host/gtk/style.h"

namespace vaelo {

namespace {

constexpr const char* RestingClass = "vaelo-resting";
constexpr const char* RestingStyle = "entry.vaelo-resting > text { color: transparent; caret-color: transparent; }";

}  // namespace

MirroredName::MirroredName(TextField& field)
    : model_(field),
      field_(field),
      overlay_(GTK_WIDGET(g_object_ref_sink(gtk_overlay_new()))),
      text_(gtk_label_new(nullptr)) {
  addStyle(RestingStyle);
  gtk_overlay_set_child(GTK_OVERLAY(overlay_), field_.widget());
  gtk_label_set_ellipsize(GTK_LABEL(text_), PANGO_ELLIPSIZE_MIDDLE);
  gtk_label_set_single_line_mode(GTK_LABEL(text_), TRUE);
  gtk_widget_set_can_target(text_, FALSE);
  // The field itself says its text.
  gtk_accessible_update_state(GTK_ACCESSIBLE(text_), GTK_ACCESSIBLE_STATE_HIDDEN, TRUE, -1);
  gtk_overlay_add_overlay(GTK_OVERLAY(overlay_), text_);
  g_signal_connect_swapped(
      overlay_, "get-child-position",
      G_CALLBACK(+[](MirroredName* self, GtkWidget* child, GdkRectangle* at) { return self->placeText(child, at); }), this);
  update();
}

MirroredName::~MirroredName() {
  g_signal_handlers_disconnect_by_data(overlay_, this);
  gtk_overlay_set_child(GTK_OVERLAY(overlay_), nullptr);
  g_object_unref(overlay_);
}

void MirroredName::update() {
  field_.update();
  gtk_label_set_text(GTK_LABEL(text_), model_.text().c_str());
  PangoAttrList* attributes = attributesOf(model_.font());
  gtk_label_set_attributes(GTK_LABEL(text_), attributes);
  pango_attr_list_unref(attributes);
  gtk_label_set_xalign(GTK_LABEL(text_), model_.textAlignment() == TextAlignment::Center ? 0.5F : 0);
  gtk_widget_set_visible(text_, !model_.isEditing());
  if (model_.isEditing()) {
    gtk_widget_remove_css_class(field_.widget(), RestingClass);
  } else {
    gtk_widget_add_css_class(field_.widget(), RestingClass);
  }
}

/// Where the field has its text.
gboolean MirroredName::placeText(GtkWidget* child, GdkRectangle* at) {
  graphene_rect_t bounds;
  GtkWidget* edited = GTK_WIDGET(gtk_editable_get_delegate(GTK_EDITABLE(field_.widget())));
  if (child != text_ || !gtk_widget_compute_bounds(edited, overlay_, &bounds)) return FALSE;
  *at = {static_cast<int>(std::lround(bounds.origin.x)), static_cast<int>(std::lround(bounds.origin.y)),
         static_cast<int>(std::lround(bounds.size.width)), static_cast<int>(std::lround(bounds.size.height))};
  return TRUE;
}

}  // namespace vaelo
