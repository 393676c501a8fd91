// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <functional>
#include <memory>
#include <optional>
#include <string>

#include "platform/error.h"
#include "platform/user_activity.h"

namespace vaelo {

/// A home-screen shortcut that the user chose.
struct ShortcutItem {
  std::string type;
  Dictionary userInfo;
};

/// What the application was started with.
struct LaunchOptions {
  std::optional<ShortcutItem> shortcutItem;
};

/// The object that the application loop reports to. Main thread.
class ApplicationDelegate {
 public:
  virtual ~ApplicationDelegate() = default;
  virtual bool applicationWillFinishLaunchingWithOptions(const LaunchOptions& options) = 0;
  virtual bool applicationDidFinishLaunchingWithOptions(const LaunchOptions& options) = 0;
  /// `url` is the link as it came, not decoded.
  virtual bool applicationOpenURLOptions(const std::string& url, const Dictionary& options) = 0;
  virtual void applicationWillResignActive() = 0;
  virtual bool applicationShouldSaveApplicationState() = 0;
  virtual bool applicationShouldRestoreApplicationState() = 0;
  virtual void applicationPerformActionForShortcutItemCompletionHandler(const ShortcutItem& item,
                                                                        std::function<void(bool)> completion) = 0;
  virtual bool applicationContinueUserActivityRestorationHandler(const std::shared_ptr<UserActivity>& activity,
                                                                 std::function<void()> restoration) = 0;
  virtual bool applicationWillContinueUserActivityWithType(const std::string& type) = 0;
  virtual void applicationDidFailToContinueUserActivityWithTypeError(const std::string& type, const Error& error) = 0;
  virtual bool applicationRunTestOptions(const std::string& name, const Dictionary& options) = 0;
};

/// The application loop. Posts DidBecomeActiveNotification and WillResignActiveNotification as its window gets and loses the
/// focus.
class Application {
 public:
  virtual ~Application() = default;
  /// Runs until the user is done. `makeDelegate` is called once, before the first callback; the loop owns what it returns.
  virtual int run(int argc, char** argv, std::function<std::shared_ptr<ApplicationDelegate>()> makeDelegate) = 0;
  /// Right-to-left interface.
  virtual bool isRightToLeft() = 0;
  virtual std::string description() = 0;
};

}  // namespace vaelo
