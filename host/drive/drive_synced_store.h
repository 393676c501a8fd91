// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <gio/gio.h>

#include <mutex>
#include <string>

#include "host/drive/drive_layout.h"
#include "platform/error.h"
#include "platform/logging.h"
#include "platform/notifications.h"
#include "platform/synced_key_value_store.h"

namespace vaelo {

/// The synced values as one small file in the mirror, MIRROR/.vaelo/values, which the drive carries to other devices: a
/// dictionary in GVariant's text format (type a{sv}). A file that is none reads as empty, and the log says so.
class DriveSyncedStore : public SyncedKeyValueStore {
 public:
  /// All outlive it.
  DriveSyncedStore(const DriveLayout& layout, LogSink& log, NotificationCenter& notifications);
  ~DriveSyncedStore() override;
  DriveSyncedStore(const DriveSyncedStore&) = delete;
  DriveSyncedStore& operator=(const DriveSyncedStore&) = delete;

  Value objectForKey(const std::string& key) override;
  /// Posts SyncedStoreDidChangeExternallyNotification whenever another process or device changed the file. Main thread,
  /// once.
  void watch();
  /// Adds a tag to the user's tags, with a label from 0 to 7; nothing when there is one of that name. Other processes may
  /// write at the same time. Errors: 514 for a name that is none; 3328 when a newer version wrote the tags; those of
  /// FileManager. A file that is damaged is set aside. Blocks; any thread.
  std::optional<Error> addTag(const std::string& name, unsigned label);
  /// The values are those of the account whose turn it is now. Main thread.
  void accountChanged();

 private:
  std::string path() const;
  Dictionary read();
  void unwatch();

  const DriveLayout& layout_;
  LogSink& log_;
  NotificationCenter& notifications_;
  GFileMonitor* monitor_ = nullptr;  // main thread
  std::mutex mutex_;
  bool watched_ = false;  // guarded by mutex_: who changes the file is heard of
  bool current_ = false;  // guarded by mutex_: values_ is what the file says
  Dictionary values_;     // guarded by mutex_
};

}  // namespace vaelo
