// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <string>
#include <vector>

#include "host/desktop/gio_launch_services.h"
#include "host/drive/account_offers.h"
#include "host/drive/drive_file_progress.h"
#include "host/drive/drive_synced_store.h"
#include "host/drive/drive_user_activities.h"
#include "host/drive/local_cloud_documents.h"
#include "host/drive/local_document_store.h"
#include "host/drive/local_file_provider.h"
#include "host/files/g_types.h"
#include "host/files/glib_log.h"
#include "host/files/glib_queues.h"
#include "host/files/icu_character_classes.h"
#include "host/files/icu_formatting.h"
#include "host/files/ini_preferences.h"
#include "host/files/local_file_coordination.h"
#include "host/files/local_file_manager.h"
#include "host/files/local_resource_values.h"
#include "host/files/long_work.h"
#include "host/files/move_history.h"
#include "host/gtk/thumbnails/document_thumbnails.h"
#include "platform/platform.h"

namespace vaelo {

/// Where the program keeps its files (XDG Base Directory Specification).
struct HostFolders {
  std::string data;
  std::string preferencesFile;
  std::string restorationFile;
  static HostFolders fromEnvironment();
};

/// The real services, made in the order in which they need each other; install() makes them the program's platform. The
/// application loop and the screens are the caller's.
class HostPlatform {
 public:
  explicit HostPlatform(const HostFolders& folders);
  ~HostPlatform();
  HostPlatform(const HostPlatform&) = delete;
  HostPlatform& operator=(const HostPlatform&) = delete;

  /// `application` and `screens` outlive the platform's use.
  void install(Application& application, ScreenFactory& screens);
  LocalCloudDocuments& drive() { return drive_; }
  LogSink& log() { return log_; }
  NotificationCenter& notifications() { return notifications_; }
  GLibQueues& queues() { return queues_; }
  ResourceValues& resourceValues() { return resourceValues_; }
  FileManager& fileManager() { return fileManager_; }
  FileCoordination& fileCoordination() { return coordination_; }
  DocumentStore& documentStore() { return documentStore_; }
  FileProvider& fileProvider() { return fileProvider_; }
  MoveHistory& moves() { return moves_; }
  LongWork& longWork() { return longWork_; }
  DriveSyncedStore& syncedStore() { return syncedStore_; }
  DriveUserActivities& userActivities() { return userActivities_; }

 private:
  GLibLog log_;
  GLibActivityTracing tracing_;
  GLibQueues queues_;
  NotificationCenter notifications_;
  GTypes types_;
  IcuCharacterClasses characterClasses_;
  IcuFormatting formatting_;
  AccountOffers offers_;  // before the drive, whose workers tell it what they measure
  LocalCloudDocuments drive_;
  MoveHistory moves_{queues_};
  LongWork longWork_{[this](bool isUnderWay) { moves_.hold(isUnderWay); }};
  LocalFileManager fileManager_{&drive_.removals(), readNameRules(drive_.layout().accountFile()), &longWork_};
  LocalDocumentStore documentStore_;
  LocalFileProvider fileProvider_;
  LocalResourceValues resourceValues_;
  DriveFileProgress fileProgress_;
  DriveUserActivities userActivities_;
  DriveSyncedStore syncedStore_;
  LocalFileCoordination coordination_;
  DocumentThumbnails thumbnails_;
  GioLaunchServices launchServices_;
  IniPreferences preferences_;
  std::unique_ptr<Platform> platform_;
  std::vector<NotificationCenter::Token> observations_;
};

}  // namespace vaelo
