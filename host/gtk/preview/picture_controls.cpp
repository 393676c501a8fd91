// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/gtk/preview/picture_controls.h"

#include <cmath>
#include <string>

#include "host/support/texts.h"

namespace vaelo {

namespace {

constexpr guint GoAfter = 3;  // seconds

struct Press {
  PictureControls::Actions* actions;
  std::function<void()> PictureControls::Actions::*action;
};

}  // namespace

PictureControls::PictureControls(Actions actions)
    : actions_(std::move(actions)), revealer_(GTK_WIDGET(g_object_ref_sink(gtk_revealer_new()))) {
  GtkWidget* box = gtk_box_new(GTK_ORIENTATION_HORIZONTAL, 6);
  gtk_widget_add_css_class(box, "osd");
  gtk_widget_add_css_class(box, "toolbar");
  out_ = addButton(box, "zoom-out-symbolic", _("Zoom out"), &Actions::zoomOut);
  scale_ = gtk_label_new(nullptr);
  gtk_label_set_width_chars(GTK_LABEL(scale_), 6);
  gtk_widget_add_css_class(scale_, "numeric");
  gtk_box_append(GTK_BOX(box), scale_);
  in_ = addButton(box, "zoom-in-symbolic", _("Zoom in"), &Actions::zoomIn);
  whole_ = addButton(box, "zoom-fit-best-symbolic", _("Show the whole picture"), &Actions::showWhole);
  gtk_revealer_set_transition_type(GTK_REVEALER(revealer_), GTK_REVEALER_TRANSITION_TYPE_CROSSFADE);
  gtk_revealer_set_child(GTK_REVEALER(revealer_), box);
  gtk_widget_set_halign(revealer_, GTK_ALIGN_END);
  gtk_widget_set_valign(revealer_, GTK_ALIGN_END);
  gtk_widget_set_margin_end(revealer_, 12);
  gtk_widget_set_margin_bottom(revealer_, 12);
}

PictureControls::~PictureControls() {
  g_clear_handle_id(&timer_, g_source_remove);
  for (GtkWidget* button : {in_, out_, whole_}) g_signal_handlers_disconnect_by_data(button, this);
  g_object_unref(revealer_);
}

GtkWidget* PictureControls::addButton(GtkWidget* box, const char* icon, const char* label,
                                      std::function<void()> Actions::*action) {
  GtkWidget* button = gtk_button_new_from_icon_name(icon);
  gtk_widget_set_tooltip_text(button, label);
  gtk_widget_set_size_request(button, 44, 44);
  gtk_widget_add_css_class(button, "circular");
  gtk_accessible_update_property(GTK_ACCESSIBLE(button), GTK_ACCESSIBLE_PROPERTY_LABEL, label, -1);
  g_signal_connect_data(
      button, "clicked", G_CALLBACK(+[](GtkButton*, gpointer press) {
        const auto* pressed = static_cast<Press*>(press);
        (pressed->actions->*pressed->action)();
      }),
      new Press{&actions_, action}, +[](gpointer press, GClosure*) { delete static_cast<Press*>(press); }, GConnectFlags(0));
  gtk_box_append(GTK_BOX(box), button);
  return button;
}

bool PictureControls::isInUse() const {
  const auto flags = GTK_STATE_FLAG_PRELIGHT | GTK_STATE_FLAG_FOCUS_WITHIN;
  return (gtk_widget_get_state_flags(gtk_revealer_get_child(GTK_REVEALER(revealer_))) & flags) != 0;
}

void PictureControls::appear() {
  gtk_revealer_set_reveal_child(GTK_REVEALER(revealer_), TRUE);
  g_clear_handle_id(&timer_, g_source_remove);
  timer_ = g_timeout_add_seconds(
      GoAfter,
      +[](gpointer data) -> gboolean {
        auto* self = static_cast<PictureControls*>(data);
        if (self->isInUse()) return G_SOURCE_CONTINUE;
        self->timer_ = 0;
        gtk_revealer_set_reveal_child(GTK_REVEALER(self->revealer_), FALSE);
        return G_SOURCE_REMOVE;
      },
      this);
}

void PictureControls::setScale(double scale, bool isFitting, bool isLargest) {
  const std::string text = filled(_("%s %%"), {numberText(std::max(1L, std::lround(scale * 100)))});
  gtk_label_set_text(GTK_LABEL(scale_), text.c_str());
  gtk_widget_set_sensitive(out_, !isFitting);
  gtk_widget_set_sensitive(whole_, !isFitting);
  gtk_widget_set_sensitive(in_, !isLargest);
}

}  // namespace vaelo
