// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/gtk/share_button.h"

#include "items/url_additions.h"
#include "platform/platform.h"
#include "platform/ui/screen_factory.h"

namespace vaelo {

ShareButton::ShareButton(std::function<std::optional<URL>()> shown)
    : shown_(std::move(shown)),
      item_(BarButtonItem::system(SystemItem::Action, [this](const BarButtonItemRef&) { pressed(); })) {}

void ShareButton::pressed() {
  const std::optional<URL> document = shown_();
  const std::optional<URL> resolved = document ? vlo_URLByResolvingBookmark(*document) : std::nullopt;
  if (!resolved) return;
  sheet_ = Platform::current().screens.makeDocumentInteraction(*resolved);
  sheet_->presentOptionsMenuFromBarButtonItem(item_, true);
}

}  // namespace vaelo
