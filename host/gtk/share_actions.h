// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <memory>
#include <vector>

#include "host/desktop/application_launch.h"
#include "host/desktop/shared_item.h"
#include "host/gtk/share_sheet.h"
#include "host/support/glib_ptr.h"
#include "platform/launch_services.h"

namespace vaelo {

class GtkWindowHost;

/// What can be done with a shared item, and doing it. Holds the window weakly; lives as long as one of its rows. Main
/// thread.
class ShareActions : public std::enable_shared_from_this<ShareActions> {
 public:
  ShareActions(SharedItem item, const std::shared_ptr<GtkWindowHost>& window);

  const SharedItem& item() const { return item_; }
  /// The rows, those that the item or the desktop rules out disabled or left out.
  std::vector<ShareRow> rows();
  /// What the user must know before choosing; mostly empty.
  std::string notice() const;
  /// Starts the application on the item, with a notice in the window. False when it could not be, which was told.
  bool openWith(GAppInfo* app);
  bool openWithApplication(const ApplicationRecord& application);
  /// Lets the user choose the application. False when the content is not here, which was told.
  bool chooseApplication();

 private:
  void addApplicationRows(std::vector<ShareRow>& rows);
  void sendByMail();
  void sendByBluetooth();
  void copyFile();
  void copyText(const std::string& text, const std::string& said);
  GRef<GAppLaunchContext> contextFor(GAppInfo* app) const;
  LaunchFailed tellFailure(const std::string& title) const;
  void toast(const std::string& text) const;
  /// False, and the user told, when the content is not here.
  bool hasContent() const;

  SharedItem item_;
  std::weak_ptr<GtkWindowHost> window_;
};

}  // namespace vaelo
