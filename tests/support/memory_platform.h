// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <memory>

#include "platform/platform.h"
#include "tests/support/memory_activity_tracing.h"
#include "tests/support/memory_application.h"
#include "tests/support/memory_characters.h"
#include "tests/support/memory_cloud_documents.h"
#include "tests/support/memory_document_store.h"
#include "tests/support/memory_file_coordination.h"
#include "tests/support/memory_file_manager.h"
#include "tests/support/memory_file_progress.h"
#include "tests/support/memory_file_provider.h"
#include "tests/support/memory_formatting.h"
#include "tests/support/memory_launch_services.h"
#include "tests/support/memory_offers.h"
#include "tests/support/memory_other_program.h"
#include "tests/support/memory_preferences.h"
#include "tests/support/memory_queues.h"
#include "tests/support/memory_resource_values.h"
#include "tests/support/memory_screens.h"
#include "tests/support/memory_synced_store.h"
#include "tests/support/memory_types.h"
#include "tests/support/memory_user_activities.h"
#include "tests/support/recording_log.h"

namespace vaelo {

/// The whole platform in memory: a drive with somebody signed in, on a virtual clock. It keeps what was asked of it and
/// logged, and goes wrong where a test says so. The contract tests hold its services to what the host's do. Installed while
/// it lives.
class MemoryPlatform {
 public:
  MemoryPlatform();
  ~MemoryPlatform();
  MemoryPlatform(const MemoryPlatform&) = delete;
  MemoryPlatform& operator=(const MemoryPlatform&) = delete;

  /// What was asked, as "operation path".
  CallRecord record;
  RecordingLog log;
  MemoryActivityTracing tracing;
  NotificationCenter notifications;

  std::shared_ptr<MemoryClock> clock = std::make_shared<MemoryClock>();
  MemoryQueues queues{clock};
  MemoryDisk disk{clock};

  MemoryApplication application;
  MemoryCharacters characters;
  MemoryFormatting formatting;
  MemoryTypes types;
  MemoryPreferences preferences;
  MemoryFileManager files{disk, record};
  MemoryResourceValues values{disk, types, record};
  MemoryFileCoordination coordination{record};
  MemoryOtherProgram others{disk, coordination};
  MemoryCloudDocuments cloud{disk, queues, notifications, record};
  MemoryDocumentStore documents{disk, record};
  MemoryFileProvider provider{disk, cloud, queues};
  MemoryFileProgress fileProgress;
  MemoryUserActivities userActivities;
  MemoryLaunchServices launch{record};
  MemoryOffers offers;
  MemoryScreens screens{record};
  MemorySyncedStore syncedStore;

 private:
  Platform platform_;
};

}  // namespace vaelo
