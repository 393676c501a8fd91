// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/gtk/action_sheet.h"

#include <algorithm>
#include <utility>

#include "host/gtk/bar_item_widget.h"
#include "host/gtk/gtk_window.h"
#include "host/gtk/pango_graphics.h"
#include "host/gtk/touch_size.h"

namespace vaelo {

namespace {

/// In characters. A sheet is as high as its texts are at this width: it must be one that a phone has, with large letters
/// too.
int textWidth() { return static_cast<int>(36 / std::max(textScale(), 1.0)); }

struct Pressed {
  std::weak_ptr<AlertController> alert;
  AlertActionRef action;
};

void addText(GtkWidget* box, const std::string& text, const char* style) {
  if (text.empty()) return;
  GtkWidget* label = gtk_label_new(text.c_str());
  gtk_label_set_wrap(GTK_LABEL(label), TRUE);
  gtk_label_set_wrap_mode(GTK_LABEL(label), PANGO_WRAP_WORD_CHAR);
  gtk_label_set_justify(GTK_LABEL(label), GTK_JUSTIFY_CENTER);
  gtk_label_set_max_width_chars(GTK_LABEL(label), textWidth());
  if (style) gtk_widget_add_css_class(label, style);
  gtk_box_append(GTK_BOX(box), label);
}

ShareAnchor anchorOf(const std::optional<PopoverAnchor>& anchor, GtkWidget* window) {
  if (!anchor) return {};
  if (const ViewRef view = anchor->sourceView.lock()) return {nullptr, areaOf(anchor->sourceRect, view)};
  return {anchor->barButtonItem ? findBarItemWidget(window, *anchor->barButtonItem) : nullptr, std::nullopt};
}

}  // namespace

ActionSheet::ActionSheet(std::shared_ptr<AlertController> alert, const std::shared_ptr<GtkWindowHost>& window,
                         std::function<void()> gone)
    : alert_(std::move(alert)), gone_(std::move(gone)) {
  const bool narrow = window->traitCollection().horizontalSizeClass == SizeClass::Compact;
  const ShareAnchor anchor = anchorOf(alert_->popoverAnchor(), GTK_WIDGET(window->widget()));
  presentation_ = std::make_unique<SharePresentation>(window, makeContent(narrow), anchor, [this] { dismissed(); });
  if (first_) gtk_widget_grab_focus(first_);
}

GtkWidget* ActionSheet::makeContent(bool narrow) {
  GtkWidget* box = gtk_box_new(GTK_ORIENTATION_VERTICAL, 12);
  const int margin = narrow ? 18 : 12;
  for (const auto set :
       {gtk_widget_set_margin_start, gtk_widget_set_margin_end, gtk_widget_set_margin_top, gtk_widget_set_margin_bottom}) {
    set(box, margin);
  }
  addText(box, alert_->title(), "heading");
  addText(box, alert_->message(), nullptr);
  for (const AlertActionRef& action : alert_->actions()) gtk_box_append(GTK_BOX(box), makeButton(action));
  if (!narrow) return box;
  // The margins belong to the sheet, which is as wide as the window.
  gtk_widget_set_hexpand(box, TRUE);
  // Large letters may make it higher than the window.
  GtkWidget* sheet = gtk_scrolled_window_new();
  gtk_scrolled_window_set_policy(GTK_SCROLLED_WINDOW(sheet), GTK_POLICY_NEVER, GTK_POLICY_AUTOMATIC);
  gtk_scrolled_window_set_propagate_natural_height(GTK_SCROLLED_WINDOW(sheet), TRUE);
  gtk_scrolled_window_set_child(GTK_SCROLLED_WINDOW(sheet), box);
  return sheet;
}

GtkWidget* ActionSheet::makeButton(const AlertActionRef& action) {
  GtkWidget* button = gtk_button_new_with_label(action->title().c_str());
  // Large letters, or a long language, would make the sheet wider than a phone.
  GtkLabel* label = GTK_LABEL(gtk_button_get_child(GTK_BUTTON(button)));
  gtk_label_set_wrap(label, TRUE);
  gtk_label_set_wrap_mode(label, PANGO_WRAP_WORD_CHAR);
  gtk_label_set_justify(label, GTK_JUSTIFY_CENTER);
  gtk_label_set_max_width_chars(label, textWidth());
  gtk_widget_set_size_request(button, -1, TouchSize);
  gtk_widget_set_sensitive(button, action->enabled());
  if (action->style() == AlertActionStyle::Destructive) gtk_widget_add_css_class(button, "destructive-action");
  if (action->style() == AlertActionStyle::Cancel || !first_) first_ = button;
  g_signal_connect_data(
      button, "clicked", G_CALLBACK(+[](GtkButton*, gpointer held) {
        const Pressed pressed = *static_cast<Pressed*>(held);
        if (const auto alert = pressed.alert.lock()) alert->performAction(pressed.action);
      }),
      new Pressed{alert_, action}, [](gpointer held, GClosure*) { delete static_cast<Pressed*>(held); }, GConnectFlags(0));
  return button;
}

void ActionSheet::close() {
  answered_ = true;
  presentation_->close();
}

void ActionSheet::dismissed() {
  const std::shared_ptr<AlertController> alert = alert_;
  const auto gone = std::move(gone_);
  const bool waved = !std::exchange(answered_, true);
  // Its answer may show another sheet, and ends this one.
  if (waved) alert->cancel();
  gone();
}

}  // namespace vaelo
