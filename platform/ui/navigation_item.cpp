// SPDX-License-Identifier: GPL-3.0-or-later
#include "platform/ui/navigation_item.h"

#include <utility>

namespace vaelo {

namespace {

std::vector<BarButtonItemRef> listOf(BarButtonItemRef item) {
  std::vector<BarButtonItemRef> items;
  if (item) items.push_back(std::move(item));
  return items;
}

}  // namespace

void NavigationItem::setTitle(std::string title) {
  if (title_ == title) return;
  title_ = std::move(title);
  changed_.emit(*this);
}

void NavigationItem::setLeftBarButtonItems(std::vector<BarButtonItemRef> items) {
  if (left_ == items) return;
  left_ = std::move(items);
  changed_.emit(*this);
}

void NavigationItem::setLeftBarButtonItem(BarButtonItemRef item) { setLeftBarButtonItems(listOf(std::move(item))); }

void NavigationItem::setRightBarButtonItems(std::vector<BarButtonItemRef> items) {
  if (right_ == items) return;
  right_ = std::move(items);
  changed_.emit(*this);
}

void NavigationItem::setRightBarButtonItem(BarButtonItemRef item) { setRightBarButtonItems(listOf(std::move(item))); }

void NavigationItem::setLeftItemsSupplementBackButton(bool supplement) {
  if (leftItemsSupplementBackButton_ == supplement) return;
  leftItemsSupplementBackButton_ = supplement;
  changed_.emit(*this);
}

void NavigationItem::setHidesBackButton(bool hides, bool) {
  if (hidesBackButton_ == hides) return;
  hidesBackButton_ = hides;
  changed_.emit(*this);
}

}  // namespace vaelo
