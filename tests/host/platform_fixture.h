// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <map>

#include "host/desktop/restoration_store.h"
#include "host/gtk/gtk_application_loop.h"
#include "host/gtk/gtk_screens.h"
#include "host/host_platform.h"
#include "tests/host/drive_test_support.h"

namespace vaelo::drive_test {

/// The whole real platform on a temporary data folder. Nothing is shown.
class PlatformTest : public DriveTest {
 protected:
  PlatformTest()
      : platform({data, root + "/preferences.ini", root + "/restoration.ini"}),
        screens(platform.drive(), platform.syncedStore()),
        loop(screens, platform.drive(), platform.notifications(), platform.userActivities(),
             RestorationStore(root + "/restoration.ini")) {
    platform.install(loop, screens);
    for (const auto& entry : std::filesystem::directory_iterator(drive)) {
      if (entry.path().filename() != ".vaelo-container") std::filesystem::remove_all(entry.path());
    }
  }
  static void runMainLoop() {
    while (g_main_context_iteration(nullptr, FALSE)) {
    }
  }
  /// Every file below `folder` with its bytes, and every folder, by their paths below it.
  static std::map<std::string, std::string> content(const std::string& folder) {
    std::map<std::string, std::string> found;
    for (const auto& entry : std::filesystem::recursive_directory_iterator(folder)) {
      const std::string path = entry.path().string().substr(folder.size() + 1);
      found[path] = entry.is_directory() ? "(folder)" : read(entry.path());
    }
    return found;
  }

  HostPlatform platform;
  GtkScreens screens;
  GtkApplicationLoop loop;
};

}  // namespace vaelo::drive_test
