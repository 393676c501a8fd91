// SPDX-License-Identifier: GPL-3.0-or-later
// Runs the whole application for some seconds and prints how long its main loop was blocked at most, before and after the
// first second, and how much memory the process holds at the end.
//   main_loop SECONDS [ARGUMENTS OF vaelo-drive...]
#include <unistd.h>

#include <algorithm>
#include <cstdio>
#include <cstdlib>
#include <fstream>

#include "app/main.h"
#include "host/desktop/restoration_store.h"
#include "host/gtk/gtk_application_loop.h"
#include "host/gtk/gtk_screens.h"
#include "host/host_platform.h"
#include "host/support/graphics_device.h"

namespace {

struct Turns {
  double began = 0;
  double first = 0;
  double longestAtStart = 0;
  double longestAfter = 0;
};

Turns turns;
GPollFunc waitForEvents;

double now() { return static_cast<double>(g_get_monotonic_time()) / 1000; }

int measuredPoll(GPollFD* fds, guint count, int timeout) {
  if (turns.began > 0) {
    if (turns.first == 0) turns.first = turns.began;
    double& longest = now() - turns.first < 1000 ? turns.longestAtStart : turns.longestAfter;
    longest = std::max(longest, now() - turns.began);
  }
  const int result = waitForEvents(fds, count, timeout);
  turns.began = now();
  return result;
}

long residentKibibytes() {
  std::ifstream file("/proc/self/statm");
  long total = 0;
  long resident = 0;
  file >> total >> resident;
  return resident * (sysconf(_SC_PAGESIZE) / 1024);
}

int report(void*) {
  std::printf("longest turn in the first second %.1f ms, after it %.1f ms; resident %ld KiB\n", turns.longestAtStart,
              turns.longestAfter, residentKibibytes());
  std::fflush(stdout);
  _exit(0);
}

}  // namespace

int main(int argc, char** argv) {
  if (argc < 2) return 1;
  const int seconds = std::atoi(argv[1]);
  argv[1] = argv[0];
  vaelo::drawWithoutGLWhereItIsEmulated();
  const vaelo::HostFolders folders = vaelo::HostFolders::fromEnvironment();
  vaelo::HostPlatform platform(folders);
  vaelo::GtkScreens screens(platform.drive(), platform.syncedStore());
  vaelo::GtkApplicationLoop loop(screens, platform.drive(), platform.notifications(), platform.userActivities(),
                                 vaelo::RestorationStore(folders.restorationFile));
  platform.install(loop, screens);
  waitForEvents = g_main_context_get_poll_func(nullptr);
  g_main_context_set_poll_func(nullptr, measuredPoll);
  g_timeout_add_seconds(static_cast<guint>(seconds), report, nullptr);
  return vaelo::vaeloMain(argc - 1, argv + 1);
}
