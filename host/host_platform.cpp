// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/host_platform.h"

#include <glib.h>

namespace vaelo {

HostFolders HostFolders::fromEnvironment() {
  const auto below = [](const char* folder, const char* rest) { return std::string(folder) + "/vaelo-drive" + rest; };
  return {below(g_get_user_data_dir(), ""), below(g_get_user_config_dir(), "/preferences.ini"),
          below(g_get_user_state_dir(), "/restoration.ini")};
}

HostPlatform::HostPlatform(const HostFolders& folders)
    : offers_({[this] { return drive_.ubiquityIdentityToken() ? drive_.account().upgrade : std::nullopt; },
               [this] { drive_.fetchQuota([](const Result<std::int64_t>&) {}); }},
              queues_, notifications_),
      drive_(folders.data, log_, queues_, notifications_),
      documentStore_(drive_.index()),
      fileProvider_(drive_.layout(), drive_.index(), queues_),
      resourceValues_(drive_.layout(), drive_.index(), types_),
      userActivities_(drive_.layout(), log_, queues_),
      syncedStore_(drive_.layout(), log_, notifications_),
      coordination_(folders.data + "/coordination.lock"),
      thumbnails_(queues_, [this](const std::string& path) { coordination_.tellPresenters(URL(path)); }),
      preferences_(folders.preferencesFile, log_) {
  coordination_.setMoveObserver([this](const URL& from, const URL& to) { moves_.moved(from, to); });
  resourceValues_.setThumbnails([this](const std::string& path) { return thumbnails_.thumbnailOf(path); });
  drive_.observeStorage([this](const StorageFigures& figures) { offers_.storageMeasured(figures); });
}

HostPlatform::~HostPlatform() {
  if (platform_) Platform::install(nullptr);
}

void HostPlatform::install(Application& application, ScreenFactory& screens) {
  platform_.reset(new Platform{.application = application,
                               .activityTracing = tracing_,
                               .cloudDocuments = drive_,
                               .characterClasses = characterClasses_,
                               .documentStore = documentStore_,
                               .fileCoordination = coordination_,
                               .fileManager = fileManager_,
                               .fileProgress = fileProgress_,
                               .fileProvider = fileProvider_,
                               .formatting = formatting_,
                               .launchServices = launchServices_,
                               .log = log_,
                               .notifications = notifications_,
                               .offers = offers_,
                               .preferences = preferences_,
                               .queues = queues_,
                               .resourceValues = resourceValues_,
                               .screens = screens,
                               .syncedStore = syncedStore_,
                               .types = types_,
                               .userActivities = userActivities_});
  Platform::install(platform_.get());
  syncedStore_.watch();
  // First of all who hear of another account, so that what they keep is of that one when the screens ask.
  observations_.push_back(notifications_.addObserver(IdentityDidChangeNotification, [this](const Notification&) {
    syncedStore_.accountChanged();
    userActivities_.accountChanged();
    offers_.accountChanged(true);
  }));
  observations_.push_back(notifications_.addObserver(AccountDidChangeNotification,
                                                     [this](const Notification&) { offers_.accountChanged(false); }));
}

}  // namespace vaelo
