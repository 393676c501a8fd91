// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include "platform/application.h"
#include "platform/cloud_documents.h"
#include "platform/document_store.h"
#include "platform/file_coordinator.h"
#include "platform/file_manager.h"
#include "platform/file_progress.h"
#include "platform/file_provider.h"
#include "platform/formatting.h"
#include "platform/launch_services.h"
#include "platform/logging.h"
#include "platform/notifications.h"
#include "platform/preferences.h"
#include "platform/queues.h"
#include "platform/resource_values.h"
#include "platform/storage_quota.h"
#include "platform/synced_key_value_store.h"
#include "platform/type_identifiers.h"
#include "platform/user_activity.h"

namespace vaelo {

class ScreenFactory;

/// The services of the platform that the program runs on, as references. The host or a test installs one before anything
/// else runs; static utilities and screens reach their services through it. Nothing else is global.
struct Platform {
  Application& application;
  ActivityTracing& activityTracing;
  CloudDocuments& cloudDocuments;
  CharacterClasses& characterClasses;
  DocumentStore& documentStore;
  FileCoordination& fileCoordination;
  FileManager& fileManager;
  FileProgress& fileProgress;
  FileProvider& fileProvider;
  Formatting& formatting;
  LaunchServices& launchServices;
  LogSink& log;
  NotificationCenter& notifications;
  OfferManager& offers;
  Preferences& preferences;
  Queues& queues;
  ResourceValues& resourceValues;
  ScreenFactory& screens;
  SyncedKeyValueStore& syncedStore;
  TypeIdentifiers& types;
  UserActivities& userActivities;

  /// The installed platform. Calling it before install() is a programming error and ends the process.
  static Platform& current();
  /// `platform` outlives all use; null uninstalls (tests).
  static void install(Platform* platform);
};

}  // namespace vaelo
