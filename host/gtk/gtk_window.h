// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <adwaita.h>

#include <functional>
#include <map>
#include <memory>

#include "host/gtk/keyboard_area.h"
#include "host/gtk/page_stack.h"
#include "host/gtk/screen_page.h"
#include "platform/ui/navigation_controller.h"
#include "platform/ui/window.h"

namespace vaelo {

class ActionSheet;
class DriveSyncedStore;
class FolderPicker;

/// The application's window on the display: one page for each screen of the root navigation controller's stack, alerts over
/// it, and the keys and buttons that go back, search and refresh. Main thread.
class GtkWindowHost : public Window, private NavigationHost, private PresentationHost {
 public:
  /// `tags` outlives it.
  GtkWindowHost(GtkApplication* application, const Rect& bounds, DriveSyncedStore& tags);
  ~GtkWindowHost() override;

  void makeKeyAndVisible() override;
  GtkWindow* widget() const { return GTK_WINDOW(window_); }
  /// Holds the pages and the messages over them as its child; what lies over them all is put on it.
  GtkOverlay* overlay() const { return GTK_OVERLAY(overlay_); }
  /// A short message at the bottom of the window. One that stays goes when the user closes it.
  AdwToast* showToast(const std::string& text, bool stays = false);
  /// One at once, with a button that calls `pressed`; it goes after `seconds`, or with 0 when it is dismissed. Its custom
  /// title is a GtkLabel. Owned by the window.
  AdwToast* showToast(const std::string& text, const char* button, std::function<void()> pressed, unsigned seconds);
  /// After a sheet went; `before` had the keyboard before it came, null when that is gone.
  void returnFocus(GtkWidget* before);
  /// Items were moved, or got other names: the lists follow them.
  void itemMoved(const URL& from, const URL& to);
  /// Puts what `make` makes between header and content of each page, of those that are shown and those to come.
  void setPageBanner(std::function<GtkWidget*()> make);

 private:
  void stackChanged(const Stack& oldStack, const Stack& newStack, bool animated, std::function<void()> done) override;
  void toolbarHiddenChanged(bool hidden, bool animated) override;
  void present(const ViewControllerRef& presenter, const ViewControllerRef& presented, bool animated,
               std::function<void()> done) override;
  void dismiss(const ViewControllerRef& presented, bool animated, std::function<void()> done) override;

  /// Null once the window is gone.
  GdkSurface* surface() const { return gtk_native_get_surface(GTK_NATIVE(window_)); }
  std::shared_ptr<NavigationController> navigation() const;
  /// Unless the screen on top takes the way back away.
  void goBack();
  /// Escape: leaves a search first, else what can be cancelled, else goes back.
  void escape();
  /// Selects every item of the list on top.
  void selectAll();
  /// Another screen is on top.
  void followTop();
  ScreenPage* topPage() const;
  void addActions();
  void sizeChanged();
  TraitCollection traitsFor(int width, int height) const;

  AdwApplicationWindow* window_;
  DriveSyncedStore& tags_;
  KeyboardArea keyboard_;
  GtkWidget* toasts_;
  GtkWidget* overlay_;
  GMenu* menu_;
  std::shared_ptr<FolderPicker> folderPicker_;
  PageStack stack_;
  std::function<GtkWidget*()> makeBanner_;
  std::map<ViewController*, std::unique_ptr<ScreenPage>> pages_;
  Stack latestStack_;
  std::map<ViewController*, GtkWindow*> dialogs_;
  std::map<ViewController*, std::unique_ptr<ActionSheet>> sheets_;
  std::shared_ptr<void> topToken_;
};

}  // namespace vaelo
