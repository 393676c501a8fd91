// SPDX-License-Identifier: GPL-3.0-or-later
// What making the record of a local document costs, beside the system calls that it can't do without: one statx, the two
// extended attributes (sharing role, tags), and asking whether a link leads the path out of the drive.
#include <benchmark/benchmark.h>
#include <fcntl.h>
#include <linux/openat2.h>
#include <sys/stat.h>
#include <sys/syscall.h>
#include <sys/xattr.h>
#include <unistd.h>

#include <cstdlib>
#include <filesystem>
#include <fstream>

#include "host/desktop/restoration_store.h"
#include "host/gtk/gtk_application_loop.h"
#include "host/gtk/gtk_screens.h"
#include "host/host_platform.h"
#include "items/dr_item.h"

namespace {

class QuietLog {
 public:
  QuietLog() {
    g_log_set_writer_func([](GLogLevelFlags, const GLogField*, gsize, gpointer) { return G_LOG_WRITER_HANDLED; }, nullptr,
                          nullptr);
  }
};

struct World {
  World()
      : platform({folder + "/data", folder + "/preferences.ini", folder + "/restoration.ini"}),
        screens(platform.drive(), platform.syncedStore()),
        loop(screens, platform.drive(), platform.notifications(), platform.userActivities(),
             vaelo::RestorationStore(folder + "/restoration.ini")) {
    platform.install(loop, screens);
    document = folder + "/data/mirror/com~marrow~Kestrel/Report.txt";
    std::ofstream(document) << "text";
  }
  ~World() { std::filesystem::remove_all(folder); }

  QuietLog quiet;
  std::string folder = [] {
    char name[] = "/tmp/vaelo-bench-XXXXXX";
    return std::string(mkdtemp(name));
  }();
  vaelo::HostPlatform platform;
  vaelo::GtkScreens screens;
  vaelo::GtkApplicationLoop loop;
  std::string document;
};

World& world() {
  static World made;
  return made;
}

void rawSystemCalls(benchmark::State& state) {
  const char* path = world().document.c_str();
  char value[256];
  for (auto step : state) {
    static_cast<void>(step);
    struct statx info;
    benchmark::DoNotOptimize(statx(AT_FDCWD, path, AT_SYMLINK_NOFOLLOW, STATX_BASIC_STATS | STATX_BTIME, &info));
    benchmark::DoNotOptimize(lgetxattr(path, "user.vaelo.share", value, sizeof value));
    benchmark::DoNotOptimize(lgetxattr(path, "user.xdg.tags", value, sizeof value));
    open_how how = {};
    how.flags = O_PATH | O_CLOEXEC;
    how.resolve = RESOLVE_NO_SYMLINKS;
    close(static_cast<int>(syscall(SYS_openat2, AT_FDCWD, path, &how, sizeof how)));
  }
}
BENCHMARK(rawSystemCalls);

void record(benchmark::State& state) {
  const vaelo::URL url(world().document);
  for (auto step : state) {
    static_cast<void>(step);
    benchmark::DoNotOptimize(vaelo::DRItem::initWithURL(url));
  }
}
BENCHMARK(record);

}  // namespace

BENCHMARK_MAIN();
