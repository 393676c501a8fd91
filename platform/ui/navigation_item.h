// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include "platform/ui/bar_button_item.h"

namespace vaelo {

/// What a screen contributes to the navigation bar above it. Main thread.
class NavigationItem : public Observable {
 public:
  const std::string& title() const { return title_; }
  void setTitle(std::string title) { set(title_, std::move(title)); }
  const BarButtonItems& leftItems() const { return leftItems_; }
  void setLeftItems(BarButtonItems items) { set(leftItems_, std::move(items)); }
  /// From the outer edge inwards.
  const BarButtonItems& rightItems() const { return rightItems_; }
  void setRightItems(BarButtonItems items) { set(rightItems_, std::move(items)); }
  bool leftItemsSupplementBackButton() const { return leftItemsSupplementBackButton_; }
  void setLeftItemsSupplementBackButton(bool supplement) { set(leftItemsSupplementBackButton_, supplement); }
  bool hidesBackButton() const { return hidesBackButton_; }
  void setHidesBackButton(bool hides) { set(hidesBackButton_, hides); }

 private:
  std::string title_;
  BarButtonItems leftItems_;
  BarButtonItems rightItems_;
  bool leftItemsSupplementBackButton_ = false;
  bool hidesBackButton_ = false;
};

}  // namespace vaelo
