// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <gtk/gtk.h>

#include <memory>

namespace vaelo {

class DriveSyncedStore;
class PreviewDetailsViewController;

/// The tags' menu of a details screen: at a press on the row of tags, of either button or for long, and for showTags(). Main
/// thread.
class DetailsTags {
 public:
  /// `page` shows the screen and its presses are watched; `tags` outlives it.
  DetailsTags(std::shared_ptr<PreviewDetailsViewController> details, GtkWidget* page, DriveSyncedStore& tags);
  ~DetailsTags();
  DetailsTags(const DetailsTags&) = delete;
  DetailsTags& operator=(const DetailsTags&) = delete;

  /// At the row of tags, or below the facts of an item that has none.
  void showTags();

 private:
  GdkRectangle place() const;
  void pressed(GtkGesture* gesture, double x, double y);

  std::shared_ptr<PreviewDetailsViewController> details_;
  GtkWidget* page_;
  DriveSyncedStore& tags_;
  GtkGesture* click_;
  GtkGesture* hold_;
};

}  // namespace vaelo
