// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/gtk/preview/markup_bar.h"

#include <algorithm>
#include <iterator>

#include "host/support/glib_ptr.h"
#include "host/support/texts.h"

namespace vaelo {

namespace {

void setLabel(GtkWidget* button, const char* label, const char* hint) {
  gtk_widget_set_tooltip_text(button, hint);
  gtk_accessible_update_property(GTK_ACCESSIBLE(button), GTK_ACCESSIBLE_PROPERTY_LABEL, label,
                                 GTK_ACCESSIBLE_PROPERTY_DESCRIPTION, hint, -1);
}

// All of them stand side by side on a phone.
void makeNarrow(GtkWidget* button) {
  const GRef<GtkCssProvider> provider(gtk_css_provider_new());
  gtk_css_provider_load_from_data(provider.get(), "button { padding-left: 9px; padding-right: 9px; }", -1);
  gtk_style_context_add_provider(gtk_widget_get_style_context(button), GTK_STYLE_PROVIDER(provider.get()),
                                 GTK_STYLE_PROVIDER_PRIORITY_APPLICATION);
}

const char* sentenceFor(PortableDocumentMarks::State state) {
  switch (state) {
    case PortableDocumentMarks::State::Unchanged:
      return "";
    case PortableDocumentMarks::State::Unsaved:
    case PortableDocumentMarks::State::Saving:
      return _("Saving…");
    case PortableDocumentMarks::State::Saved:
      return _("Saved");
    case PortableDocumentMarks::State::Failed:
      return _("Not saved");
  }
  return "";
}

}  // namespace

MarkupBar::MarkupBar(Events events)
    : events_(std::move(events)),
      revealer_(GTK_WIDGET(g_object_ref_sink(gtk_revealer_new()))),
      undo_(gtk_button_new_from_icon_name("edit-undo-symbolic")),
      state_(gtk_label_new(nullptr)) {
  GtkWidget* box = gtk_box_new(GTK_ORIENTATION_HORIZONTAL, 0);
  gtk_widget_add_css_class(box, "toolbar");
  gtk_box_append(GTK_BOX(box), makeTool(MarkTool::Highlight, _("Highlight"), _("Highlight Text")));
  gtk_box_append(GTK_BOX(box), makeTool(MarkTool::Ink, _("Draw"), _("Draw on the Page")));
  gtk_box_append(GTK_BOX(box), makeTool(MarkTool::Note, _("Note"), _("Put a Note on the Page")));
  setLabel(undo_, _("Undo Mark"), _("Undo the Last Mark"));
  gtk_widget_set_sensitive(undo_, FALSE);
  gtk_box_append(GTK_BOX(box), undo_);
  gtk_label_set_ellipsize(GTK_LABEL(state_), PANGO_ELLIPSIZE_END);
  gtk_widget_set_hexpand(state_, TRUE);
  gtk_widget_set_halign(state_, GTK_ALIGN_END);
  for (const char* name : {"dim-label", "caption"}) gtk_widget_add_css_class(state_, name);
  gtk_box_append(GTK_BOX(box), state_);
  GtkWidget* done = gtk_button_new_with_label(_("Done"));
  setLabel(done, _("Done"), _("Leave Markup"));
  makeNarrow(done);
  gtk_widget_set_valign(done, GTK_ALIGN_CENTER);
  gtk_widget_set_margin_end(done, 6);
  // In a long language or large letters they take more than a phone's width. The way out stays in sight.
  GtkWidget* scrolled = gtk_scrolled_window_new();
  gtk_scrolled_window_set_policy(GTK_SCROLLED_WINDOW(scrolled), GTK_POLICY_AUTOMATIC, GTK_POLICY_NEVER);
  gtk_scrolled_window_set_child(GTK_SCROLLED_WINDOW(scrolled), box);
  gtk_widget_set_hexpand(scrolled, TRUE);
  GtkWidget* bar = gtk_box_new(GTK_ORIENTATION_HORIZONTAL, 0);
  for (GtkWidget* part : {scrolled, done}) gtk_box_append(GTK_BOX(bar), part);
  gtk_revealer_set_child(GTK_REVEALER(revealer_), bar);
  gtk_widget_set_visible(revealer_, FALSE);

  g_signal_connect_swapped(undo_, "clicked", G_CALLBACK(+[](MarkupBar* self) { self->events_.undo(); }), this);
  g_signal_connect_swapped(done, "clicked", G_CALLBACK(+[](MarkupBar* self) { self->open(false); }), this);
  g_signal_connect_swapped(revealer_, "notify::reveal-child", G_CALLBACK(+[](MarkupBar* self) {
                             if (!self->isOpen()) self->putToolAway();
                             self->events_.toggled(self->isOpen());
                           }),
                           this);
}

MarkupBar::~MarkupBar() {
  g_signal_handlers_disconnect_by_data(revealer_, this);
  for (GtkWidget* tool : tools_) g_signal_handlers_disconnect_by_data(tool, this);
  gtk_revealer_set_child(GTK_REVEALER(revealer_), nullptr);
  g_object_unref(revealer_);
}

GtkWidget* MarkupBar::makeTool(MarkTool tool, const char* label, const char* hint) {
  GtkWidget* button = gtk_toggle_button_new_with_label(label);
  setLabel(button, label, hint);
  makeNarrow(button);
  g_signal_connect(button, "toggled",
                   G_CALLBACK(+[](GtkToggleButton* toggled, MarkupBar* self) { self->toolToggled(toggled); }), this);
  tools_[static_cast<std::size_t>(tool) - 1] = button;
  return button;
}

void MarkupBar::choose(MarkTool tool) {
  if (tool == tool_) return;
  tool_ = tool;
  for (std::size_t i = 0; i < std::size(tools_); ++i) {
    gtk_toggle_button_set_active(GTK_TOGGLE_BUTTON(tools_[i]), i + 1 == static_cast<std::size_t>(tool));
  }
  events_.toolChosen(tool);
}

void MarkupBar::toolToggled(GtkToggleButton* button) {
  const auto place = std::find(std::begin(tools_), std::end(tools_), GTK_WIDGET(button)) - std::begin(tools_);
  const auto tool = static_cast<MarkTool>(place + 1);
  if (gtk_toggle_button_get_active(button)) {
    choose(tool);
  } else if (tool == tool_) {
    choose(MarkTool::None);
  }
}

void MarkupBar::show(PortableDocumentMarks::State state, bool mayUndo) {
  gtk_label_set_text(GTK_LABEL(state_), sentenceFor(state));
  gtk_widget_set_sensitive(undo_, mayUndo);
}

void MarkupBar::offer(bool offered) {
  if (!offered) open(false);
  gtk_widget_set_visible(revealer_, offered);
}

GtkWidget* MarkupBar::makeToggle() const {
  GtkWidget* toggle = gtk_toggle_button_new();
  gtk_button_set_icon_name(GTK_BUTTON(toggle), "document-edit-symbolic");
  setLabel(toggle, _("Markup"), _("Mark This Document"));
  g_object_bind_property(revealer_, "reveal-child", toggle, "active",
                         static_cast<GBindingFlags>(G_BINDING_BIDIRECTIONAL | G_BINDING_SYNC_CREATE));
  g_object_bind_property(revealer_, "visible", toggle, "visible", G_BINDING_SYNC_CREATE);
  return toggle;
}

}  // namespace vaelo
