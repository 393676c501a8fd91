// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/gtk/action_sheet.h"

#include <utility>

#include "host/gtk/bar_item_widget.h"
#include "host/gtk/gtk_window.h"
#include "host/gtk/touch_size.h"

namespace vaelo {

namespace {

constexpr int TextWidth = 36;  // characters

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
  gtk_label_set_max_width_chars(GTK_LABEL(label), TextWidth);
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
  GtkWidget* sheet = gtk_box_new(GTK_ORIENTATION_VERTICAL, 0);
  gtk_widget_set_hexpand(box, TRUE);
  gtk_box_append(GTK_BOX(sheet), box);
  return sheet;
}

GtkWidget* ActionSheet::makeButton(const AlertActionRef& action) {
  GtkWidget* button = gtk_button_new_with_label(action->title().c_str());
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
