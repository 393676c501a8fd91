// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/gtk/continue_banner.h"

#include <utility>

#include "host/gtk/touch_size.h"
#include "host/support/texts.h"

namespace vaelo {

namespace {

std::string documentIn(const UserActivity& activity) {
  const Dictionary userInfo = activity.userInfo();
  const auto found = userInfo.find(UserActivityDocumentURLKey);
  const std::string* text = found == userInfo.end() ? nullptr : found->second.get<std::string>();
  return text ? *text : std::string();
}

std::string keyOf(const OfferedActivity& offered) { return offered.deviceID + " " + documentIn(*offered.activity); }

struct Banner {
  std::shared_ptr<ContinueOffer> offer;
  GtkWidget* revealer;
  GtkWidget* label;
  GtkWidget* carryOn;
  std::shared_ptr<void> observation;

  void show() const {
    // The words stay while the bar slides out.
    if (offer->text()) {
      gtk_label_set_text(GTK_LABEL(label), offer->text()->c_str());
      gtk_accessible_update_property(GTK_ACCESSIBLE(carryOn), GTK_ACCESSIBLE_PROPERTY_LABEL, offer->text()->c_str(), -1);
    }
    if (offer->text()) gtk_widget_set_visible(revealer, TRUE);
    gtk_revealer_set_reveal_child(GTK_REVEALER(revealer), offer->text().has_value());
  }
  /// What has slid out must not be found by the keyboard or a screen reader.
  void slid() const {
    if (!offer->text() && !gtk_revealer_get_child_revealed(GTK_REVEALER(revealer))) gtk_widget_set_visible(revealer, FALSE);
  }
};

}  // namespace

ContinueOffer::ContinueOffer(FileProvider& provider, Queues& queues, std::function<std::string(const URL&)> nameOf,
                             Continue carryOn)
    : provider_(provider), queues_(queues), nameOf_(std::move(nameOf)), carryOn_(std::move(carryOn)) {}

void ContinueOffer::setActivity(const std::optional<OfferedActivity>& offered) {
  offered_ = offered;
  if (!offered || documentIn(*offered->activity).empty() || keyOf(*offered) == answered_) {
    offered_.reset();
    return show(std::nullopt, std::nullopt);
  }
  resolve();
}

void ContinueOffer::lookAgain() {
  if (offered_ && !shown_) resolve();
}

// The document's name is not taken from the other device: it is that of what would be opened here.
void ContinueOffer::resolve() {
  provider_.DocumentURLFromBookmarkableString(
      documentIn(*offered_->activity),
      [weak = weak_from_this(), &main = queues_.main(), offer = *offered_](const Result<URL>& url) {
        main.async([weak, offer, url] {
          const auto self = weak.lock();
          if (!self || !self->offered_ || self->offered_->activity != offer.activity) return;
          if (!url.value) return self->show(std::nullopt, std::nullopt);
          self->show(offer, filled(_("Continue from %s: %s"), {offer.deviceName, self->nameOf_(*url.value)}));
        });
      });
}

void ContinueOffer::carryOn() {
  if (!shown_) return;
  const std::shared_ptr<UserActivity> activity = shown_->activity;
  dismiss();
  carryOn_(activity);
}

void ContinueOffer::dismiss() {
  if (!shown_) return;
  answered_ = keyOf(*shown_);
  if (offered_ && keyOf(*offered_) == answered_) offered_.reset();
  show(std::nullopt, std::nullopt);
}

void ContinueOffer::show(const std::optional<OfferedActivity>& offered, std::optional<std::string> text) {
  shown_ = offered;
  if (text == text_) return;
  text_ = std::move(text);
  for (const auto& weak : std::vector(observers_)) {
    if (const auto observer = weak.lock()) (*observer)();
  }
}

std::shared_ptr<void> ContinueOffer::observe(std::function<void()> changed) {
  std::erase_if(observers_, [](const auto& each) { return each.expired(); });
  auto observer = std::make_shared<std::function<void()>>(std::move(changed));
  observers_.push_back(observer);
  return observer;
}

GtkWidget* makeContinueBanner(const std::shared_ptr<ContinueOffer>& offer) {
  GtkWidget* revealer = gtk_revealer_new();
  GtkWidget* box = gtk_box_new(GTK_ORIENTATION_HORIZONTAL, 6);
  GtkWidget* carryOn = gtk_button_new();
  GtkWidget* words = gtk_box_new(GTK_ORIENTATION_HORIZONTAL, 12);
  GtkWidget* label = gtk_label_new(nullptr);
  GtkWidget* dismiss = gtk_button_new_from_icon_name("window-close-symbolic");
  auto* banner = new Banner{offer, revealer, label, carryOn, nullptr};

  gtk_label_set_xalign(GTK_LABEL(label), 0);
  gtk_label_set_wrap(GTK_LABEL(label), TRUE);
  gtk_label_set_wrap_mode(GTK_LABEL(label), PANGO_WRAP_WORD_CHAR);
  gtk_label_set_lines(GTK_LABEL(label), 2);
  gtk_label_set_ellipsize(GTK_LABEL(label), PANGO_ELLIPSIZE_END);
  gtk_widget_set_hexpand(label, TRUE);
  gtk_box_append(GTK_BOX(words), gtk_image_new_from_icon_name("computer-symbolic"));
  gtk_box_append(GTK_BOX(words), label);
  gtk_button_set_child(GTK_BUTTON(carryOn), words);
  gtk_widget_set_hexpand(carryOn, TRUE);
  gtk_widget_set_size_request(carryOn, -1, TouchSize);
  gtk_widget_set_size_request(dismiss, TouchSize, TouchSize);
  gtk_widget_set_valign(dismiss, GTK_ALIGN_CENTER);
  gtk_widget_add_css_class(dismiss, "flat");
  gtk_widget_set_tooltip_text(dismiss, _("Dismiss"));
  gtk_accessible_update_property(GTK_ACCESSIBLE(dismiss), GTK_ACCESSIBLE_PROPERTY_LABEL, _("Dismiss"), -1);
  for (const auto set :
       {gtk_widget_set_margin_start, gtk_widget_set_margin_end, gtk_widget_set_margin_top, gtk_widget_set_margin_bottom}) {
    set(box, 6);
  }
  gtk_box_append(GTK_BOX(box), carryOn);
  gtk_box_append(GTK_BOX(box), dismiss);
  gtk_revealer_set_child(GTK_REVEALER(revealer), box);

  const auto onClick = [banner](GtkWidget* button, void (*handler)(Banner*)) {
    g_signal_connect_swapped(button, "clicked", G_CALLBACK(handler), banner);
  };
  onClick(
      carryOn, +[](Banner* self) { self->offer->carryOn(); });
  onClick(
      dismiss, +[](Banner* self) { self->offer->dismiss(); });
  g_signal_connect_swapped(revealer, "notify::child-revealed", G_CALLBACK(+[](Banner* self) { self->slid(); }), banner);
  gtk_widget_set_visible(revealer, FALSE);
  banner->observation = offer->observe([banner] { banner->show(); });
  banner->show();
  g_object_set_data_full(G_OBJECT(revealer), "banner", banner, [](gpointer data) { delete static_cast<Banner*>(data); });
  return revealer;
}

}  // namespace vaelo
