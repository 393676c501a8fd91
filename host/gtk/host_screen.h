// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <gtk/gtk.h>

#include <memory>
#include <vector>

#include "platform/url.h"

namespace vaelo {

class BarButtonItem;
class SearchController;

/// The widgets that a screen of the host's own brings along. Main thread.
class HostScreen {
 public:
  virtual ~HostScreen() = default;
  /// What fills the page between its bars; made on first use, owned by the screen.
  virtual GtkWidget* contentWidget() = 0;
  /// Widgets for the end of the header bar, from the outer edge inwards; made anew for each call. On a narrow window what
  /// narrowActions() has needs none.
  virtual std::vector<GtkWidget*> headerWidgets(bool /*narrow*/) { return {}; }
  /// What is chosen from the window's menu where the window is too narrow for more buttons; null for nothing.
  virtual GActionGroup* narrowActions() { return nullptr; }
  /// The icon that stands for a button's title there; null when the title stands.
  virtual const char* narrowIcon(const BarButtonItem& /*item*/) { return nullptr; }
  /// The user went to the page's own search, or left it: Ctrl+F, and Escape. False when there is nothing to do.
  virtual bool toggleSearch() { return false; }
  virtual bool closeSearch() { return false; }
  virtual void refresh() {}
  /// The page came to be the one that shows: its content takes the keyboard, where there is something to do with it.
  virtual void takeFocus() {}
  /// An item was moved, or got another name.
  virtual void itemMoved(const URL& /*from*/, const URL& /*to*/) {}
  /// The page came to be the one that shows again, after that of the item: its row is where the keyboard belongs.
  virtual void cameBackFrom(const URL& /*item*/) {}
  /// Shows the search that was presented over the screen, and takes it away.
  virtual void showSearch(const std::shared_ptr<SearchController>& /*search*/) {}
  virtual void hideSearch() {}
};

}  // namespace vaelo
