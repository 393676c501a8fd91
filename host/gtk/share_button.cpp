// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/gtk/share_button.h"

#include "items/url_additions.h"
#include "platform/platform.h"
#include "platform/ui/screen_factory.h"

namespace vaelo {

ShareButton::ShareButton(std::function<std::optional<URL>()> shown)
    : shown_(std::move(shown)),
      item_(BarButtonItem::system(SystemItem::Action, [this](const BarButtonItemRef&) { pressed(); })) {}

std::optional<URL> ShareButton::shared() const {
  const std::optional<URL> document = shown_();
  return document ? vlo_URLByResolvingBookmark(*document) : std::nullopt;
}

void ShareButton::shownChanged() {
  if (sheet_ && sheet_->url() != shared()) sheet_ = nullptr;
}

void ShareButton::pressed() {
  const std::optional<URL> resolved = shared();
  if (!resolved) return;
  sheet_ = Platform::current().screens.makeDocumentInteraction(*resolved);
  sheet_->presentOptionsMenuFromBarButtonItem(item_, true);
}

}  // namespace vaelo
