// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <adwaita.h>

#include <functional>
#include <vector>

namespace vaelo {

/// Shows the top one of a stack of pages, slides between them, and lets a swipe from the edge go back. Main thread.
class PageStack {
 public:
  PageStack();
  ~PageStack();
  PageStack(const PageStack&) = delete;
  PageStack& operator=(const PageStack&) = delete;

  GtkWidget* widget() const { return GTK_WIDGET(leaflet_); }
  /// Shows the last of `pages`; those that are no longer among them leave when the slide has ended, and then `done` is
  /// called. A call during a slide ends that slide first.
  void setPages(const std::vector<GtkWidget*>& pages, bool animated, std::function<void()> done);
  const std::vector<GtkWidget*>& pages() const { return pages_; }
  /// Whether a swipe goes back, as it does from the beginning.
  void setSwipesBack(bool swipes) { adw_leaflet_set_can_navigate_back(leaflet_, swipes); }
  /// Called when a swipe went back, with the number of pages that are left.
  void onSwipedBack(std::function<void(std::size_t)> handler) { swipedBack_ = std::move(handler); }

 private:
  void slideEnded();
  void removeLeavingPages();

  AdwLeaflet* leaflet_;
  std::vector<GtkWidget*> pages_;
  std::vector<GtkWidget*> leaving_;
  std::function<void()> done_;
  std::function<void(std::size_t)> swipedBack_;
  bool settingPages_ = false;
};

}  // namespace vaelo
