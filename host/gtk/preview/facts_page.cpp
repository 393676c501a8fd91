// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/gtk/preview/facts_page.h"

#include <cmath>

#include "host/support/glib_ptr.h"
#include "host/support/texts.h"
#include "platform/platform.h"
#include "platform/ui/screen_factory.h"

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

}  // namespace

FactsPage::FactsPage(std::function<void()> arrived)
    : page_(GTK_WIDGET(g_object_ref_sink(adw_status_page_new()))),
      box_(gtk_box_new(GTK_ORIENTATION_VERTICAL, 24)),
      bar_(gtk_progress_bar_new()),
      open_(gtk_button_new_with_label(_("Open With Another Application"))),
      arrived_(std::move(arrived)) {
  gtk_progress_bar_set_show_text(GTK_PROGRESS_BAR(bar_), TRUE);
  gtk_widget_set_visible(bar_, FALSE);
  gtk_box_append(GTK_BOX(box_), bar_);
  gtk_label_set_wrap(GTK_LABEL(gtk_button_get_child(GTK_BUTTON(open_))), TRUE);
  gtk_label_set_justify(GTK_LABEL(gtk_button_get_child(GTK_BUTTON(open_))), GTK_JUSTIFY_CENTER);
  gtk_widget_add_css_class(open_, "pill");
  gtk_widget_set_halign(open_, GTK_ALIGN_CENTER);
  gtk_box_append(GTK_BOX(box_), open_);
  // On a wide window a bar from edge to edge is hard to read.
  GtkWidget* clamp = adw_clamp_new();
  adw_clamp_set_maximum_size(ADW_CLAMP(clamp), 400);
  adw_clamp_set_child(ADW_CLAMP(clamp), box_);
  adw_status_page_set_child(ADW_STATUS_PAGE(page_), clamp);
  g_signal_connect_swapped(open_, "clicked", G_CALLBACK(+[](FactsPage* self) { self->openElsewhere(); }), this);
}

FactsPage::~FactsPage() {
  stopFollowing();
  g_signal_handlers_disconnect_by_data(open_, this);
  g_object_unref(page_);
}

bool FactsPage::isDownloaded(const URL& item) { return isHere(valuesOf(item)); }

void FactsPage::showNothing() {
  stopFollowing();
  gtk_widget_set_visible(box_, FALSE);
  adw_status_page_set_title(ADW_STATUS_PAGE(page_), _("Nothing to show"));
  adw_status_page_set_description(ADW_STATUS_PAGE(page_), nullptr);
}

void FactsPage::show(const URL& item, const std::string& message) {
  stopFollowing();
  showValues(item, valuesOf(item), message);
}

void FactsPage::showNotDownloaded(const URL& item) {
  stopFollowing();
  // Before it is looked at, so that it can't arrive unnoticed.
  followDownload(item);
  const ResourceMap values = valuesOf(item);
  showValues(item, values, "");
  if (isHere(values)) downloadEnded();
}

void FactsPage::showValues(const URL& item, const ResourceMap& values, const std::string& message) {
  path_ = item.path();
  std::string facts = textOf(values, ResourceKey::LocalizedTypeDescription);
  const auto size = values.find(ResourceKey::FileSize);
  if (size != values.end()) {
    const std::string bytes = Platform::current().formatting.byteCount(size->second.unsignedValue(), ByteCountStyle::File);
    facts += (facts.empty() ? "" : "\n") + bytes;
  }
  here_ = isHere(values);
  facts_ = facts;
  message_ = message;
  const std::string name = textOf(values, ResourceKey::LocalizedName);
  AdwStatusPage* page = ADW_STATUS_PAGE(page_);
  adw_status_page_set_title(page, markupOf(name.empty() ? item.lastPathComponent() : name).c_str());
  describe();
  gtk_widget_set_visible(box_, TRUE);
  // What is not here, or not here any more, can't be opened anywhere.
  gtk_widget_set_visible(open_, here_ && values.contains(ResourceKey::LocalizedName));
  showIcon(item);
}

void FactsPage::describe() {
  std::string text = facts_;
  if (!here_ && !gtk_widget_get_visible(bar_)) {
    text += std::string("\n") + _("Not downloaded") + "\n\n" + _("It opens here as soon as it is on this device.");
  }
  if (!message_.empty()) text += "\n\n" + message_;
  adw_status_page_set_description(ADW_STATUS_PAGE(page_), markupOf(text).c_str());
}

void FactsPage::showBar(bool shows) {
  if (shows == static_cast<bool>(gtk_widget_get_visible(bar_))) return;
  gtk_widget_set_visible(bar_, shows);
  describe();
}

void FactsPage::stopFollowing() {
  g_clear_handle_id(&arrival_, g_source_remove);
  observation_.reset();
  subscription_.reset();
  gtk_widget_set_visible(bar_, FALSE);
}

// Told from within the subscription, which ends when the document is shown; so that waits for the next turn.
void FactsPage::downloadEnded() {
  observation_.reset();
  if (arrival_) return;
  if (!isDownloaded(URL(path_))) return showBar(false);
  arrival_ = g_idle_add(
      +[](gpointer data) -> gboolean {
        auto* self = static_cast<FactsPage*>(data);
        self->arrival_ = 0;
        const auto arrived = self->arrived_;
        arrived();
        return G_SOURCE_REMOVE;
      },
      this);
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
    return FileProgress::Withdrawn([this] { downloadEnded(); });
  });
}

void FactsPage::progressChanged(const std::shared_ptr<Progress>& progress) {
  showBar(true);
  const std::int64_t total = progress->totalUnits();
  std::string text;
  if (total > 0) {
    const double fraction = static_cast<double>(progress->completedUnits()) / static_cast<double>(total);
    gtk_progress_bar_set_fraction(GTK_PROGRESS_BAR(bar_), fraction);
    // TRANSLATORS: %s is a number of percents.
    text = filled(_("Downloading… %s%%"), {numberText(std::lround(fraction * 100))});
  } else {
    gtk_progress_bar_pulse(GTK_PROGRESS_BAR(bar_));
    // TRANSLATORS: %s is how much has come so far, as in "12 MB".
    text = filled(_("Downloading… %s"), {Platform::current().formatting.byteCount(
                                            static_cast<std::uint64_t>(progress->completedUnits()), ByteCountStyle::File)});
  }
  gtk_progress_bar_set_text(GTK_PROGRESS_BAR(bar_), text.c_str());
  gtk_accessible_update_property(GTK_ACCESSIBLE(bar_), GTK_ACCESSIBLE_PROPERTY_LABEL, text.c_str(), -1);
}

void FactsPage::openElsewhere() { Platform::current().screens.makeDocumentInteraction(URL(path_))->presentOpenInMenu(); }

}  // namespace vaelo
