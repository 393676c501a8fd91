// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <string>
#include <vector>

#include "platform/ui/bar_button_item.h"

namespace vaelo {

/// What a screen puts into the navigation bar. Main thread.
class NavigationItem {
 public:
  const std::string& title() const { return title_; }
  void setTitle(std::string title);
  /// From the leading edge inwards.
  const std::vector<BarButtonItemRef>& leftBarButtonItems() const { return left_; }
  void setLeftBarButtonItems(std::vector<BarButtonItemRef> items);
  BarButtonItemRef leftBarButtonItem() const { return left_.empty() ? nullptr : left_.front(); }
  /// Null clears the list.
  void setLeftBarButtonItem(BarButtonItemRef item);
  /// From the trailing edge inwards.
  const std::vector<BarButtonItemRef>& rightBarButtonItems() const { return right_; }
  void setRightBarButtonItems(std::vector<BarButtonItemRef> items);
  BarButtonItemRef rightBarButtonItem() const { return right_.empty() ? nullptr : right_.front(); }
  void setRightBarButtonItem(BarButtonItemRef item);
  /// The back button stays beside left items.
  bool leftItemsSupplementBackButton() const { return leftItemsSupplementBackButton_; }
  void setLeftItemsSupplementBackButton(bool supplement);
  bool hidesBackButton() const { return hidesBackButton_; }
  void setHidesBackButton(bool hides, bool animated = false);
  /// Emitted after a property changed; changes inside an item are the item's own.
  Signal<NavigationItem&>& changed() { return changed_; }

 private:
  std::string title_;
  std::vector<BarButtonItemRef> left_;
  std::vector<BarButtonItemRef> right_;
  bool leftItemsSupplementBackButton_ = false;
  bool hidesBackButton_ = false;
  Signal<NavigationItem&> changed_;
};

}  // namespace vaelo
