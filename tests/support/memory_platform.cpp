// SPDX-License-Identifier: GPL-3.0-or-later
#include "tests/support/memory_platform.h"

namespace vaelo {

MemoryPlatform::MemoryPlatform()
    : platform_{.application = application,
                .activityTracing = tracing,
                .cloudDocuments = cloud,
                .characterClasses = characters,
                .documentStore = documents,
                .fileCoordination = coordination,
                .fileManager = files,
                .fileProgress = fileProgress,
                .fileProvider = provider,
                .formatting = formatting,
                .launchServices = launch,
                .log = log,
                .notifications = notifications,
                .offers = offers,
                .preferences = preferences,
                .queues = queues,
                .resourceValues = values,
                .screens = screens,
                .syncedStore = syncedStore,
                .types = types,
                .userActivities = userActivities} {
  Platform::install(&platform_);
}

MemoryPlatform::~MemoryPlatform() {
  Platform::install(nullptr);
  clock->forgetWhatIsLeft();
}

}  // namespace vaelo
