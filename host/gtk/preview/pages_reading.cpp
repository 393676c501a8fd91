// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/gtk/preview/pages_reading.h"

#include <algorithm>
#include <utility>

#include "host/support/texts.h"

namespace vaelo {

namespace {

/// Who scrolls through a thousand pages doesn't want to hear them.
constexpr guint SettledAfter = 200;  // milliseconds
/// More than people listen to at a stretch.
constexpr std::size_t MostCharacters = 20'000;

}  // namespace

PagesReading::PagesReading(PagesCanvas& canvas, std::function<const PageText*(int page)> textOf)
    : canvas_(canvas), textOf_(std::move(textOf)), reader_([this] { update(); }) {}

PagesReading::~PagesReading() { g_clear_handle_id(&settling_, g_source_remove); }

void PagesReading::update() {
  g_clear_handle_id(&settling_, g_source_remove);
  settling_ = g_timeout_add(
      SettledAfter,
      [](gpointer self) -> gboolean {
        auto* reading = static_cast<PagesReading*>(self);
        reading->settling_ = 0;
        reading->tell();
        return G_SOURCE_REMOVE;
      },
      this);
}

void PagesReading::tell() {
  const auto [first, last] = canvas_.visiblePages();
  if (last < first) return;
  const int current = canvas_.currentPage();
  std::string told = filled(_("Page %s of %s"), {numberText(current + 1), numberText(canvas_.layout().count())});
  for (int page = first; reader_.isOn() && page <= last; ++page) {
    const PageText* text = textOf_(page);
    if (!text) continue;
    const std::string words = text->text({0, std::min(text->size(), MostCharacters)});
    canvas_.parts().describe(page, words);
    if (page == current) told += "\n" + words;
  }
  if (told == told_) return;
  told_ = told;
  gtk_accessible_update_property(GTK_ACCESSIBLE(canvas_.widget()), GTK_ACCESSIBLE_PROPERTY_DESCRIPTION, told.c_str(), -1);
}

}  // namespace vaelo
