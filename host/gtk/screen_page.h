// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <adwaita.h>

#include <functional>
#include <memory>
#include <utility>

#include "platform/ui/view_controller.h"

namespace vaelo {

class DetailsTags;
class DriveSyncedStore;
class HostScreen;
class PreviewPage;
class ViewMirror;

/// One page of the window: a screen's header bar, its content and its toolbar, which follow the screen. Main thread.
class ScreenPage {
 public:
  /// `goBack` is what the back button does; `menu` is shown at the end of the header bar (a reference is taken). `tags`
  /// outlives it.
  ScreenPage(ViewControllerRef screen, std::function<void()> goBack, GMenuModel* menu, DriveSyncedStore& tags);
  ~ScreenPage();
  ScreenPage(const ScreenPage&) = delete;
  ScreenPage& operator=(const ScreenPage&) = delete;

  GtkWidget* widget() const { return box_; }
  const ViewControllerRef& screen() const { return screen_; }
  HostScreen* hostScreen() const { return hostScreen_; }
  /// The search in the page's folder or document: opens or closes it; closes it; false when there is nothing to do.
  bool toggleSearch();
  bool closeSearch();
  /// The menu of the tags of the document whose details are shown; without one nothing happens.
  void showTags();
  /// Reads what is shown anew.
  void refresh();
  /// Gives the keyboard to the content, unless something in it has it.
  void takeFocus();
  /// After a sheet over the page went; `before` had the keyboard before it came, and may be gone since.
  void returnFocus(GtkWidget* before);
  /// A widget between header and content; the page owns it.
  void setBanner(GtkWidget* banner);
  void setCanGoBack(bool can);
  void setToolbarHidden(bool hidden);
  /// 0 while there is none.
  int toolbarHeight() const;
  /// Calls when the toolbar has come or gone, or may have another height.
  void onToolbarShown(std::function<void()> shown) { toolbarShown_ = std::move(shown); }
  /// On a narrow window the title needs the room of the buttons that a phone's windows don't have, and of those that can
  /// be in the menu.
  void setNarrow(bool narrow);

 private:
  void showHostWidgets();
  void showBar();
  /// The buttons of a preview stand in the header bar, or where it is narrow in the toolbar.
  void showPreviewWidgets();
  void showToolbar();
  /// After buttons have gone, one of which may have had the keyboard.
  void keepFocus();

  ViewControllerRef screen_;
  HostScreen* hostScreen_;
  GtkWidget* box_;
  GtkWidget* header_;
  GtkWidget* title_;
  GtkWidget* back_;
  GtkWidget* toolbarEdge_;
  GtkWidget* toolbar_;
  GtkWidget* menuButton_ = nullptr;
  std::vector<GtkWidget*> hostWidgets_;
  std::vector<GtkWidget*> barWidgets_;
  std::function<void()> goBack_;
  std::function<void()> toolbarShown_;
  std::unique_ptr<PreviewPage> preview_;
  std::unique_ptr<ViewMirror> mirror_;  // of a screen that has neither content nor a preview
  std::unique_ptr<DetailsTags> tags_;
  bool canGoBack_ = false;
  bool narrow_ = false;
  bool toolbarHidden_ = true;
  std::shared_ptr<void> barToken_;
  std::shared_ptr<void> screenToken_;
};

}  // namespace vaelo
