// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/gtk/preview_page.h"

#include "host/support/glib_ptr.h"
#include "platform/platform.h"

namespace vaelo {

namespace {

std::string markupOf(const std::string& text) { return takeString(g_markup_escape_text(text.c_str(), -1)); }

void applicationChosen(GtkDialog* dialog, int response, gpointer) {
  if (response == GTK_RESPONSE_OK) {
    const GRef<GAppInfo> app(gtk_app_chooser_get_app_info(GTK_APP_CHOOSER(dialog)));
    GFile* file = nullptr;
    g_object_get(dialog, "gfile", &file, nullptr);
    const GRef<GFile> chosen(file);
    GList files{file, nullptr, nullptr};
    if (app) g_app_info_launch(app.get(), &files, nullptr, nullptr);
  }
  gtk_window_destroy(GTK_WINDOW(dialog));
}

}  // namespace

PreviewPage::PreviewPage(std::shared_ptr<PreviewController> controller)
    : controller_(std::move(controller)),
      page_(GTK_WIDGET(g_object_ref_sink(adw_status_page_new()))),
      open_(gtk_button_new_with_label("Open With Another Application")) {
  gtk_widget_add_css_class(open_, "pill");
  gtk_widget_set_halign(open_, GTK_ALIGN_CENTER);
  adw_status_page_set_child(ADW_STATUS_PAGE(page_), open_);
  g_signal_connect_swapped(open_, "clicked", G_CALLBACK(+[](PreviewPage* self) { self->openElsewhere(); }), this);
  token_ = controller_->previewChanged().connect([this](PreviewController&, PreviewChange) { show(); });
  show();
}

PreviewPage::~PreviewPage() {
  g_signal_handlers_disconnect_by_data(open_, this);
  g_object_unref(page_);
}

void PreviewPage::show() {
  AdwStatusPage* page = ADW_STATUS_PAGE(page_);
  const bool hasItem = controller_->itemCount() > 0;
  gtk_widget_set_visible(open_, hasItem);
  if (!hasItem) {
    adw_status_page_set_title(page, "Nothing to show");
    adw_status_page_set_description(page, nullptr);
    return;
  }
  const URL item = controller_->itemAtIndex(0);
  Platform& platform = Platform::current();
  const Result<ResourceMap> values = platform.resourceValues.promisedItemResourceValues(
      item, {ResourceKey::LocalizedName, ResourceKey::LocalizedTypeDescription, ResourceKey::TypeIdentifier,
             ResourceKey::FileSize, ResourceKey::DownloadingStatus});
  const auto text = [&](ResourceKey key) {
    const auto found = values.value ? values.value->find(key) : ResourceMap::const_iterator();
    const std::string* held = values.value && found != values.value->end() ? found->second.get<std::string>() : nullptr;
    return held ? *held : std::string();
  };
  std::string facts = text(ResourceKey::LocalizedTypeDescription);
  if (values.value && values.value->contains(ResourceKey::FileSize)) {
    const std::uint64_t bytes = values.value->at(ResourceKey::FileSize).unsignedValue();
    facts += (facts.empty() ? "" : "\n") + platform.formatting.byteCount(bytes, ByteCountStyle::File);
  }
  const bool here = text(ResourceKey::DownloadingStatus) != DownloadingStatusNotDownloaded;
  if (!here) facts += "\nNot downloaded";
  gtk_widget_set_sensitive(open_, here);
  adw_status_page_set_title(page, markupOf(text(ResourceKey::LocalizedName)).c_str());
  adw_status_page_set_description(page, markupOf(facts).c_str());
  const std::string type = takeString(g_content_type_guess(item.lastPathComponent().c_str(), nullptr, 0, nullptr));
  const GRef<GIcon> icon(g_content_type_get_icon(type.c_str()));
  GtkIconTheme* theme = gtk_icon_theme_get_for_display(gtk_widget_get_display(page_));
  const GRef<GtkIconPaintable> paintable(gtk_icon_theme_lookup_by_gicon(
      theme, icon.get(), 128, gtk_widget_get_scale_factor(page_), gtk_widget_get_direction(page_), GtkIconLookupFlags(0)));
  adw_status_page_set_paintable(page, GDK_PAINTABLE(paintable.get()));
}

void PreviewPage::openElsewhere() {
  if (controller_->itemCount() == 0) return;
  const GRef<GFile> file(g_file_new_for_path(controller_->itemAtIndex(0).path().c_str()));
  GtkWidget* chooser =
      gtk_app_chooser_dialog_new(GTK_WINDOW(gtk_widget_get_root(page_)), GTK_DIALOG_MODAL, file.get());
  g_signal_connect(chooser, "response", G_CALLBACK(applicationChosen), nullptr);
  gtk_window_present(GTK_WINDOW(chooser));
}

}  // namespace vaelo
