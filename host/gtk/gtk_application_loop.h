// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <adwaita.h>

#include <functional>
#include <memory>
#include <optional>
#include <string>

#include "host/desktop/restoration_store.h"
#include "host/desktop/search_provider.h"
#include "host/gtk/window_focus.h"
#include "platform/application.h"
#include "platform/notifications.h"

namespace vaelo {

class ContinueOffer;
class DriveUserActivities;
class GtkScreens;

/// The application loop on GApplication: one instance a session, which links, shortcuts, searches of the shell and other
/// devices' activities reach over D-Bus, also before it runs; and the windows' focus told as active and inactive. Main
/// thread.
class GtkApplicationLoop : public Application {
 public:
  /// All outlive it.
  GtkApplicationLoop(GtkScreens& screens, LocalCloudDocuments& drive, NotificationCenter& notifications,
                     DriveUserActivities& activities, RestorationStore restoration);
  ~GtkApplicationLoop() override;
  int run(int argc, char** argv, std::function<std::shared_ptr<ApplicationDelegate>()> makeDelegate) override;
  bool isRightToLeft() override { return gtk_widget_get_default_direction() == GTK_TEXT_DIR_RTL; }
  std::string description() override;

 private:
  void beginService();
  void activate(std::uint32_t timestamp = 0);
  void launch(const LaunchOptions& options);
  void present(std::uint32_t timestamp);
  void performShortcut(const ShortcutItem& item);
  void openRecentDocument();
  void continueSearch(const std::string& query, std::uint32_t timestamp);
  void openSearchResult(const std::string& documentID, std::uint32_t timestamp);
  int commandLine(GApplicationCommandLine* line);
  /// True when the application took the link.
  bool openLink(const std::string& link);
  void offerToContinue();
  void continueActivity(const std::shared_ptr<UserActivity>& activity);
  void focusChanged(bool focused);
  void restore();
  void saveState();
  void showShortcuts();
  void showAbout();
  void showAccounts();
  void tellOfDamage();

  GtkScreens& screens_;
  LocalCloudDocuments& drive_;
  SearchProvider searchProvider_;
  NotificationCenter& notifications_;
  DriveUserActivities& activities_;
  RestorationStore restoration_;
  AdwApplication* application_;
  std::function<std::shared_ptr<ApplicationDelegate>()> makeDelegate_;
  std::shared_ptr<ApplicationDelegate> delegate_;
  std::shared_ptr<void> rebuiltToken_;
  std::shared_ptr<ContinueOffer> continueOffer_;
  std::optional<WindowFocus> focus_;
};

}  // namespace vaelo
