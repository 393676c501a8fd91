// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/gtk/preview/facts_page.h"

#include <cmath>

#include "host/support/glib_ptr.h"
#include "platform/platform.h"

namespace vaelo {

namespace {

std::string markupOf(const std::string& text) { return takeString(g_markup_escape_text(text.c_str(), -1)); }

std::string textOf(const ResourceMap& values, ResourceKey key) {
  const auto found = values.find(key);
  const std::string* text = found == values.end() ? nullptr : found->second.get<std::string>();
  return text ? *text : std::string();
}

ResourceMap valuesOf(const URL& item) {
  Result<ResourceMap> values = Platform::current().resourceValues.promisedItemResourceValues(
      item, {ResourceKey::LocalizedName, ResourceKey::LocalizedTypeDescription, ResourceKey::FileSize,
             ResourceKey::DownloadingStatus});
  return values.value.value_or(ResourceMap());
}

bool isHere(const ResourceMap& values) {
  return textOf(values, ResourceKey::DownloadingStatus) != DownloadingStatusNotDownloaded;
}

void tellFailure(GtkWindow* parent, const std::string& name, const std::string& reason) {
  GtkWidget* dialog = adw_message_dialog_new(parent, ("“" + name + "” couldn’t be opened.").c_str(), reason.c_str());
  adw_message_dialog_add_response(ADW_MESSAGE_DIALOG(dialog), "ok", "OK");
  gtk_window_present(GTK_WINDOW(dialog));
}

void applicationChosen(GtkDialog* dialog, int response, gpointer) {
  if (response == GTK_RESPONSE_OK) {
    const GRef<GAppInfo> app(gtk_app_chooser_get_app_info(GTK_APP_CHOOSER(dialog)));
    GFile* file = nullptr;
    g_object_get(dialog, "gfile", &file, nullptr);
    const GRef<GFile> chosen(file);
    GList files{file, nullptr, nullptr};
    const GRef<GdkAppLaunchContext> context(gdk_display_get_app_launch_context(gtk_widget_get_display(GTK_WIDGET(dialog))));
    GError* error = nullptr;
    if (app && !g_app_info_launch(app.get(), &files, G_APP_LAUNCH_CONTEXT(context.get()), &error)) {
      const GErrorPtr owned(error);
      tellFailure(gtk_window_get_transient_for(GTK_WINDOW(dialog)), takeString(g_file_get_basename(file)), error->message);
    }
  }
  gtk_window_destroy(GTK_WINDOW(dialog));
}

}  // namespace

FactsPage::FactsPage()
    : page_(GTK_WIDGET(g_object_ref_sink(adw_status_page_new()))),
      box_(gtk_box_new(GTK_ORIENTATION_VERTICAL, 24)),
      bar_(gtk_progress_bar_new()),
      open_(gtk_button_new_with_label("Open With Another Application")) {
  gtk_progress_bar_set_show_text(GTK_PROGRESS_BAR(bar_), TRUE);
  gtk_widget_set_visible(bar_, FALSE);
  gtk_box_append(GTK_BOX(box_), bar_);
  gtk_widget_add_css_class(open_, "pill");
  gtk_widget_set_halign(open_, GTK_ALIGN_CENTER);
  gtk_box_append(GTK_BOX(box_), open_);
  adw_status_page_set_child(ADW_STATUS_PAGE(page_), box_);
  g_signal_connect_swapped(open_, "clicked", G_CALLBACK(+[](FactsPage* self) { self->openElsewhere(); }), this);
}

FactsPage::~FactsPage() {
  g_signal_handlers_disconnect_by_data(open_, this);
  g_object_unref(page_);
}

bool FactsPage::isDownloaded(const URL& item) { return isHere(valuesOf(item)); }

void FactsPage::showNothing() {
  subscription_.reset();
  gtk_widget_set_visible(box_, FALSE);
  adw_status_page_set_title(ADW_STATUS_PAGE(page_), "Nothing to show");
  adw_status_page_set_description(ADW_STATUS_PAGE(page_), nullptr);
}

void FactsPage::show(const URL& item, const std::string& message) {
  path_ = item.path();
  const ResourceMap values = valuesOf(item);
  std::string facts = textOf(values, ResourceKey::LocalizedTypeDescription);
  const auto size = values.find(ResourceKey::FileSize);
  if (size != values.end()) {
    const std::string bytes = Platform::current().formatting.byteCount(size->second.unsignedValue(), ByteCountStyle::File);
    facts += (facts.empty() ? "" : "\n") + bytes;
  }
  const bool here = isHere(values);
  if (!here) facts += "\nNot downloaded";
  if (!message.empty()) facts += "\n\n" + message;
  const std::string name = textOf(values, ResourceKey::LocalizedName);
  AdwStatusPage* page = ADW_STATUS_PAGE(page_);
  adw_status_page_set_title(page, markupOf(name.empty() ? item.lastPathComponent() : name).c_str());
  adw_status_page_set_description(page, markupOf(facts).c_str());
  gtk_widget_set_visible(box_, TRUE);
  gtk_widget_set_sensitive(open_, here);
  showIcon(item);
  here ? subscription_.reset() : followDownload(item);
  if (here) gtk_widget_set_visible(bar_, FALSE);
}

void FactsPage::showIcon(const URL& item) {
  const std::string type = takeString(g_content_type_guess(item.lastPathComponent().c_str(), nullptr, 0, nullptr));
  const GRef<GIcon> icon(g_content_type_get_icon(type.c_str()));
  GtkIconTheme* theme = gtk_icon_theme_get_for_display(gtk_widget_get_display(page_));
  const GRef<GtkIconPaintable> paintable(gtk_icon_theme_lookup_by_gicon(
      theme, icon.get(), 128, gtk_widget_get_scale_factor(page_), gtk_widget_get_direction(page_), GtkIconLookupFlags(0)));
  adw_status_page_set_paintable(ADW_STATUS_PAGE(page_), GDK_PAINTABLE(paintable.get()));
}

void FactsPage::followDownload(const URL& item) {
  subscription_ = Platform::current().fileProgress.subscribe(item, [this](std::shared_ptr<Progress> progress) {
    if (progress->kind() != FileProgressKind) return FileProgress::Withdrawn([] {});
    observation_ =
        progress->observe("fractionCompleted", [this, weak = std::weak_ptr<Progress>(progress)](const std::string&) {
          if (const auto alive = weak.lock()) progressChanged(alive);
        });
    progressChanged(progress);
    return FileProgress::Withdrawn([this] {
      observation_.reset();
      gtk_widget_set_visible(bar_, FALSE);
    });
  });
}

void FactsPage::progressChanged(const std::shared_ptr<Progress>& progress) {
  gtk_widget_set_visible(bar_, TRUE);
  const std::int64_t total = progress->totalUnits();
  const double fraction = total > 0 ? static_cast<double>(progress->completedUnits()) / static_cast<double>(total) : 0;
  gtk_progress_bar_set_fraction(GTK_PROGRESS_BAR(bar_), fraction);
  gtk_progress_bar_set_text(GTK_PROGRESS_BAR(bar_),
                            ("Downloading… " + std::to_string(std::lround(fraction * 100)) + "%").c_str());
}

void FactsPage::openElsewhere() {
  const GRef<GFile> file(g_file_new_for_path(path_.c_str()));
  GtkWidget* chooser = gtk_app_chooser_dialog_new(GTK_WINDOW(gtk_widget_get_root(page_)), GTK_DIALOG_MODAL, file.get());
  g_signal_connect(chooser, "response", G_CALLBACK(applicationChosen), nullptr);
  gtk_window_present(GTK_WINDOW(chooser));
}

}  // namespace vaelo
