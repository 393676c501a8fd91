// SPDX-License-Identifier: GPL-3.0-or-later
#include "platform/ui/bar_button_item.h"

namespace vaelo {

std::shared_ptr<BarButtonItem> BarButtonItem::withTitle(std::string title, Action action) {
  auto item = system(Kind::Title, std::move(action));
  item->title_ = std::move(title);
  return item;
}

std::shared_ptr<BarButtonItem> BarButtonItem::system(Kind kind, Action action) {
  auto item = std::make_shared<BarButtonItem>();
  item->kind_ = kind;
  item->action_ = std::move(action);
  return item;
}

std::shared_ptr<BarButtonItem> BarButtonItem::withCustomView(std::shared_ptr<View> view) {
  auto item = system(Kind::CustomView);
  item->customView_ = std::move(view);
  return item;
}

void BarButtonItem::press() {
  if (enabled_ && action_) action_(*this);
}

}  // namespace vaelo
