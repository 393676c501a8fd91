// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <memory>
#include <optional>
#include <string>

#include "platform/application.h"
#include "platform/result.h"
#include "platform/ui/window.h"

namespace vaelo {

class NavController;

/// Makes the window with the root NavController, and turns every way of starting or reopening the application into a call on
/// it. Lives for the whole process. Main thread, but for the completion of decoding a bookmark.
class AppDelegate : public ApplicationDelegate, public std::enable_shared_from_this<AppDelegate> {
 public:
  static constexpr const char* URLScheme = "vaelodriveapp";

  /// Null before the launch.
  const WindowRef& rootWindow() const { return rootWindow_; }
  /// What the platform calls the same window.
  const WindowRef& window() const { return rootWindow_; }

  /// False when a shortcut launched the application: it has been acted on already.
  bool applicationWillFinishLaunchingWithOptions(const LaunchOptions& options) override;
  bool applicationDidFinishLaunchingWithOptions(const LaunchOptions& options) override;
  /// Follows a link "vaelodriveapp:/path?mode=preview|details|info". The path, names and values are percent-decoded twice,
  /// so a literal percent sign is written %2525; the host is not looked at. False when the link can't be followed.
  bool applicationOpenURLOptions(const std::string& url, const Dictionary& options) override;
  void applicationWillResignActive() override;
  /// State is only saved, and only restored, while an account is signed in.
  bool applicationShouldSaveApplicationState() override;
  bool applicationShouldRestoreApplicationState() override;
  /// The completion is never called.
  void applicationPerformActionForShortcutItemCompletionHandler(const ShortcutItem& item,
                                                                std::function<void(bool)> completion) override;
  /// The restoration handler is never called. True for every type of activity that is known, found or not.
  bool applicationContinueUserActivityRestorationHandler(const std::shared_ptr<UserActivity>& activity,
                                                         std::function<void()> restoration) override;
  bool applicationWillContinueUserActivityWithType(const std::string& type) override;
  void applicationDidFailToContinueUserActivityWithTypeError(const std::string& type, const Error& error) override;
  /// There is no performance harness on this platform: false for every test.
  bool applicationRunTestOptions(const std::string& name, const Dictionary& options) override;

 private:
  /// The window's root, when it is a NavController.
  std::shared_ptr<NavController> rootNavController() const;
  bool checkVaeloState() const;
  void openRecentDocument(const ShortcutItem& item);
  void continueSearch(const Dictionary& userInfo);
  void openSearchResult(const Dictionary& userInfo);
  void openBatonDocument(const Dictionary& userInfo);
  static void batonDocumentDecoded(const std::weak_ptr<AppDelegate>& weakSelf, const Result<URL>& result);
  void warpSoon(const std::optional<URL>& url);
  void dumpWindowInfo() {}

  WindowRef rootWindow_;
};

}  // namespace vaelo
