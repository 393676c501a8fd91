// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/gtk/upgrade_flow.h"

#include <adwaita.h>

#include "host/drive/account_offers.h"
#include "host/gtk/dialog_size.h"
#include "host/support/glib_ptr.h"
#include "host/support/texts.h"
#include "platform/platform.h"

namespace vaelo {

namespace {

std::string hostOf(const std::string& address) {
  GUri* uri = g_uri_parse(address.c_str(), G_URI_FLAGS_NONE, nullptr);
  std::string host = uri && g_uri_get_host(uri) ? g_uri_get_host(uri) : address;
  if (uri) g_uri_unref(uri);
  return host;
}

std::string byteText(std::int64_t count) {
  return Platform::current().formatting.byteCount(static_cast<std::uint64_t>(count), ByteCountStyle::Binary);
}

class UpgradeScreen : public ViewController, public HostDialog {
 public:
  UpgradeScreen(std::shared_ptr<ProviderOffer> offer, UpgradeFlow::OpenPage openPage)
      : offer_(std::move(offer)), openPage_(std::move(openPage)) {}
  std::string className() const override { return "UpgradeScreen"; }

  GtkWindow* makeDialog(GtkWindow* over) override {
    GtkWidget* window = adw_window_new();
    gtk_window_set_transient_for(GTK_WINDOW(window), over);
    gtk_window_set_modal(GTK_WINDOW(window), TRUE);
    gtk_window_set_title(GTK_WINDOW(window), _("Upgrade Storage"));
    const int height = setDialogSize(GTK_WINDOW(window), over, 520);
    GtkWidget* box = gtk_box_new(GTK_ORIENTATION_VERTICAL, 0);
    gtk_box_append(GTK_BOX(box), adw_header_bar_new());
    gtk_box_append(GTK_BOX(box), makePage(height));
    adw_window_set_content(ADW_WINDOW(window), box);
    GtkEventController* keys = gtk_shortcut_controller_new();
    gtk_shortcut_controller_add_shortcut(
        GTK_SHORTCUT_CONTROLLER(keys),
        gtk_shortcut_new(gtk_shortcut_trigger_parse_string("Escape"), gtk_named_action_new("window.close")));
    gtk_widget_add_controller(window, keys);
    g_signal_connect(window, "close-request", G_CALLBACK(+[](GtkWindow*, UpgradeScreen* self) -> gboolean {
                       self->dismissViewControllerAnimated(true);
                       return TRUE;
                     }),
                     this);
    return GTK_WINDOW(window);
  }

 private:
  GtkWidget* makePage(int height) {
    const StorageFigures& figures = offer_->figures();
    GtkWidget* page = adw_status_page_new();
    gtk_widget_set_vexpand(page, TRUE);
    gtk_widget_add_css_class(page, "compact");
    // Where there is little room it is for the buttons.
    constexpr int pictureFrom = 440;
    if (height >= pictureFrom) adw_status_page_set_icon_name(ADW_STATUS_PAGE(page), "drive-harddisk-symbolic");
    adw_status_page_set_title(ADW_STATUS_PAGE(page),
                              figures.free == 0 ? _("Your storage is full") : _("Your storage is almost full"));
    const std::string text = filled(_("%1$s of %2$s are free. Your provider %3$s has more."),
                                    {byteText(figures.free), byteText(figures.total), hostOf(offer_->terms().page)});
    const std::string markup = takeString(g_markup_escape_text(text.c_str(), -1));
    adw_status_page_set_description(ADW_STATUS_PAGE(page), markup.c_str());

    GtkWidget* column = gtk_box_new(GTK_ORIENTATION_VERTICAL, 12);
    gtk_widget_set_halign(column, GTK_ALIGN_CENTER);
    GtkWidget* level = gtk_level_bar_new_for_interval(0, 100);
    gtk_level_bar_set_value(GTK_LEVEL_BAR(level), 100 - figures.freePercent());
    gtk_accessible_update_property(GTK_ACCESSIBLE(level), GTK_ACCESSIBLE_PROPERTY_LABEL, _("Used storage"), -1);
    gtk_box_append(GTK_BOX(column), level);
    addButton(
        column, _("See Offers"), "suggested-action", +[](UpgradeScreen* self) {
          self->openPage_(self->offer_->terms().page);
          self->dismissViewControllerAnimated(true);
        });
    addButton(
        column, _("Not Now"), nullptr, +[](UpgradeScreen* self) { self->dismissViewControllerAnimated(true); });
    adw_status_page_set_child(ADW_STATUS_PAGE(page), column);
    return page;
  }

  void addButton(GtkWidget* column, const char* label, const char* style, void (*pressed)(UpgradeScreen*)) {
    GtkWidget* button = gtk_button_new_with_label(label);
    gtk_widget_add_css_class(button, "pill");
    if (style) gtk_widget_add_css_class(button, style);
    g_signal_connect_swapped(button, "clicked", G_CALLBACK(pressed), this);
    gtk_box_append(GTK_BOX(column), button);
  }

  std::shared_ptr<ProviderOffer> offer_;
  UpgradeFlow::OpenPage openPage_;
};

}  // namespace

void UpgradeFlow::beginFlowWithPresentingViewController(const ViewControllerRef& presenter) {
  const auto provider = std::dynamic_pointer_cast<ProviderOffer>(offer_);
  if (provider && presenter) presenter->presentViewController(std::make_shared<UpgradeScreen>(provider, openPage_), true);
}

}  // namespace vaelo
