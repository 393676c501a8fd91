// SPDX-License-Identifier: GPL-3.0-or-later
// Moving 10,000 items inside one file system as the application does it, beside `mv` of the same ("of_mv": times as long),
// and how long it holds the main loop at most.
#include <benchmark/benchmark.h>
#include <glib.h>
#include <sys/wait.h>
#include <unistd.h>

#include <algorithm>
#include <chrono>
#include <cstdlib>
#include <filesystem>
#include <fstream>

#include "app/nav_controller.h"
#include "bench/turns.h"
#include "host/desktop/restoration_store.h"
#include "host/gtk/gtk_application_loop.h"
#include "host/gtk/gtk_screens.h"
#include "host/host_platform.h"

namespace {

constexpr int Items = 10000;
using Clock = std::chrono::steady_clock;
using vaelo::bench::Turns;

double since(Clock::time_point start) { return std::chrono::duration<double>(Clock::now() - start).count(); }

struct World {
  World()
      : platform({folder + "/data", folder + "/preferences.ini", folder + "/restoration.ini"}),
        screens(platform.drive(), platform.syncedStore()),
        loop(screens, platform.drive(), platform.notifications(), platform.userActivities(),
             vaelo::RestorationStore(folder + "/restoration.ini")) {
    platform.install(loop, screens);
    std::filesystem::create_directories(one);
    std::filesystem::create_directories(other);
    for (int i = 0; i < Items; ++i) std::ofstream(one + "/Item " + std::to_string(i) + ".txt");
  }
  ~World() { std::filesystem::remove_all(folder); }
  static std::vector<vaelo::URL> itemsIn(const std::string& place) {
    std::vector<vaelo::URL> items;
    for (const auto& entry : std::filesystem::directory_iterator(place)) items.emplace_back(entry.path().string());
    return items;
  }
  double mv(const std::string& from, const std::string& to) const {
    std::vector<std::string> words{"mv", "-t", to};
    for (const vaelo::URL& item : itemsIn(from)) words.push_back(item.path());
    std::vector<char*> arguments;
    for (std::string& word : words) arguments.push_back(word.data());
    arguments.push_back(nullptr);
    const Clock::time_point start = Clock::now();
    const pid_t child = fork();
    if (child == 0) {
      execvp("mv", arguments.data());
      _exit(127);
    }
    int status = 0;
    waitpid(child, &status, 0);
    return since(start);
  }

  std::string folder = [] {
    char name[] = "/tmp/vaelo-bench-XXXXXX";
    return std::string(mkdtemp(name));
  }();
  std::string one = folder + "/data/mirror/com~marrow~Kestrel/One";
  std::string other = folder + "/data/mirror/com~marrow~Kestrel/Other";
  vaelo::HostPlatform platform;
  vaelo::GtkScreens screens;
  vaelo::GtkApplicationLoop loop;
};

void onMainLoop(const std::function<void()>& deed) {
  bool done = false;
  std::function<void()> both = [&] {
    deed();
    done = true;
  };
  g_idle_add_once([](gpointer held) { (*static_cast<std::function<void()>*>(held))(); }, &both);
  while (!done) g_main_context_iteration(nullptr, TRUE);
}

void moveItems(benchmark::State& state) {
  World world;
  const auto navigation = std::make_shared<vaelo::NavController>();
  double program = 1e9;
  for (int i = 0; i < 4; ++i)
    program = std::min({program, world.mv(world.one, world.other), world.mv(world.other, world.one)});
  double best = 1e9;
  Turns::watch();
  for (auto step : state) {
    static_cast<void>(step);
    const std::vector<vaelo::URL> items = World::itemsIn(world.one);
    double took = 0;
    std::size_t errors = 0;
    onMainLoop([&] {
      const Clock::time_point start = Clock::now();
      errors = navigation->moveItemsToDirectoryToDirectory(items, vaelo::URL(world.other, true)).size();
      took = since(start);
    });
    state.SetIterationTime(took);
    best = std::min(best, took);
    if (errors != 0 || items.size() != Items) state.SkipWithError("not everything was moved");
    world.mv(world.other, world.one);
    while (g_main_context_iteration(nullptr, FALSE)) {
    }
  }
  state.counters["longest_turn_ms"] = Turns::longest();
  state.counters["mv_ms"] = program * 1000;
  state.counters["of_mv"] = best / program;
}
BENCHMARK(moveItems)->UseManualTime()->Unit(benchmark::kMillisecond)->Iterations(8);

}  // namespace

int main(int argc, char** argv) {
  // What the log costs depends on where it goes; the application's lines are made, and dropped here.
  g_log_set_writer_func([](GLogLevelFlags, const GLogField*, gsize, gpointer) { return G_LOG_WRITER_HANDLED; }, nullptr,
                        nullptr);
  benchmark::Initialize(&argc, argv);
  benchmark::RunSpecifiedBenchmarks();
  return 0;
}
