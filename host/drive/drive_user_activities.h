// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <functional>
#include <memory>
#include <optional>
#include <string>

#include "host/drive/drive_layout.h"
#include "platform/logging.h"
#include "platform/queues.h"
#include "platform/user_activity.h"

namespace vaelo {

/// What the user does on another device of this drive.
struct OfferedActivity {
  std::string deviceID;
  std::string deviceName;  ///< fit to be shown
  std::shared_ptr<UserActivity> activity;
};

/// Activities that other devices on the drive can continue. The current one is a small file of this device's own in the
/// mirror, MIRROR/.vaelo/activities/DEVICE.ini, which the drive carries to the others; it goes when the activity resigns.
/// Files are written and read on a queue of its own. Made and destroyed on the main thread; destruction waits for what is to
/// be written.
class DriveUserActivities : public UserActivities {
 public:
  using OfferChanged = std::function<void(const std::optional<OfferedActivity>&)>;

  /// All outlive it.
  DriveUserActivities(const DriveLayout& layout, LogSink& log, Queues& queues);
  ~DriveUserActivities() override;
  std::shared_ptr<UserActivity> makeActivity(const std::string& type) override;

  /// Follows what other devices do, from now on until it is destroyed: `changed` gets, on the main thread, the latest
  /// activity of another device that is not what the user does here too, whenever that is another one. What this device left
  /// behind when it crashed goes. Files that can't be believed are ignored, and the log tells of each once. Main thread,
  /// once.
  void watchOthers(OfferChanged changed);
  /// Another account has its turn: nothing is current any more, and what is told and followed from now on is in its mirror.
  /// Main thread.
  void accountChanged();

 private:
  class Publisher;
  class Watch;
  std::shared_ptr<Publisher> publisher_;
  std::shared_ptr<Watch> watch_;
};

}  // namespace vaelo
