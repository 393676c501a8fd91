// SPDX-License-Identifier: GPL-3.0-or-later
// Selecting all of a folder of 100,000 items in its window, with title and buttons brought up to date, beside the cost of
// visiting each row once ("visits" says how many times as much). Wants a display: tools/with-display bench_select_all.
#include <adwaita.h>
#include <benchmark/benchmark.h>

#include <cstdlib>
#include <filesystem>
#include <fstream>

#include "app/nav_controller.h"
#include "host/desktop/restoration_store.h"
#include "host/gtk/folder_list_screen.h"
#include "host/gtk/gtk_application_loop.h"
#include "host/gtk/gtk_screens.h"
#include "host/host_platform.h"

namespace {

constexpr std::size_t Items = 100000;

void dropLog() {
  g_log_set_writer_func([](GLogLevelFlags, const GLogField*, gsize, gpointer) { return G_LOG_WRITER_HANDLED; }, nullptr,
                        nullptr);
  // As it is for users: debug lines are wanted by nobody.
  g_log_set_debug_enabled(FALSE);
}

class List : public vaelo::FolderListScreen {
 public:
  using FolderListScreen::FolderListScreen;
  using FolderListScreen::folderView;
};

/// The application's navigation with one large folder in edit mode, on screen.
struct World {
  explicit World(bool folders)
      : platform({folder + "/data", folder + "/preferences.ini", folder + "/restoration.ini"}),
        screens(platform.drive(), platform.syncedStore()),
        loop(screens, platform.drive(), platform.notifications(), platform.userActivities(),
             vaelo::RestorationStore(folder + "/restoration.ini")) {
    platform.install(loop, screens);
    const std::string large = folder + "/data/mirror/com~marrow~Kestrel/Large";
    std::filesystem::create_directories(large);
    for (std::size_t i = 0; i < Items; ++i) {
      const std::string path = large + "/Item " + std::to_string(i);
      if (folders) {
        std::filesystem::create_directory(path);
      } else {
        std::ofstream(path + ".txt");
      }
    }
    navigation = std::make_shared<vaelo::NavController>();
    navigation->view();
    list = std::make_shared<List>(vaelo::URL(large, true), platform.drive(), screens, platform.syncedStore());
    navigation->pushViewController(list, false);
    navigation->initNewListController(list);
    window = gtk_window_new();
    gtk_window_set_child(GTK_WINDOW(window), list->contentWidget());
    gtk_window_set_default_size(GTK_WINDOW(window), 800, 640);
    gtk_window_present(GTK_WINDOW(window));
    while (list->containedItems().size() != Items) g_main_context_iteration(nullptr, TRUE);
    navigation->setEditModeAndUpdateUIForViewController(true, list);
    settle();
  }
  ~World() {
    list.reset();
    gtk_window_destroy(GTK_WINDOW(window));
    navigation.reset();
    std::filesystem::remove_all(folder);
  }
  static void settle() {
    while (g_main_context_iteration(nullptr, FALSE)) {
    }
  }
  double visitSeconds() const {
    const auto start = std::chrono::steady_clock::now();
    const vaelo::URLList& items = list->containedItems();
    for (std::size_t i = 0; i < items.size(); ++i) benchmark::DoNotOptimize(items[i]);
    return std::chrono::duration<double>(std::chrono::steady_clock::now() - start).count();
  }

  std::string folder = [] {
    char name[] = "/tmp/vaelo-bench-XXXXXX";
    return std::string(mkdtemp(name));
  }();
  vaelo::HostPlatform platform;
  vaelo::GtkScreens screens;
  vaelo::GtkApplicationLoop loop;
  std::shared_ptr<vaelo::NavController> navigation;
  std::shared_ptr<List> list;
  GtkWidget* window = nullptr;
};

void measure(benchmark::State& state, World& world, const std::function<void()>& selectAll) {
  double visit = 1e9;
  for (int i = 0; i < 9; ++i) visit = std::min(visit, world.visitSeconds());
  double total = 0;
  for (auto step : state) {
    static_cast<void>(step);
    const auto start = std::chrono::steady_clock::now();
    selectAll();
    // What the main loop does because of it: title, buttons, the rows' check marks.
    World::settle();
    const double took = std::chrono::duration<double>(std::chrono::steady_clock::now() - start).count();
    state.SetIterationTime(took);
    total += took;
    if (world.list->selectedItemCount() != Items || !world.navigation->barButtonDeleteItem()->enabled()) {
      state.SkipWithError("not everything is selected");
    }
    world.list->userSelected({});
    World::settle();
  }
  state.counters["visit_ms"] = visit * 1000;
  state.counters["visits"] = total / static_cast<double>(state.iterations()) / visit;
}

/// Control+A, as the list's own action hears it.
void byKey(benchmark::State& state, bool folders) {
  World world(folders);
  measure(state, world, [&world] { gtk_selection_model_select_all(world.list->folderView().model().selectionModel()); });
}
BENCHMARK_CAPTURE(byKey, documents, false)->UseManualTime()->Iterations(20)->Unit(benchmark::kMillisecond);
BENCHMARK_CAPTURE(byKey, folders, true)->UseManualTime()->Iterations(20)->Unit(benchmark::kMillisecond);

void byCommand(benchmark::State& state) {
  World world(false);
  measure(state, world, [&world] { world.navigation->selectAllItems(nullptr); });
}
BENCHMARK(byCommand)->UseManualTime()->Iterations(20)->Unit(benchmark::kMillisecond);

}  // namespace

int main(int argc, char** argv) {
  dropLog();
  gtk_init();
  adw_init();
  benchmark::Initialize(&argc, argv);
  benchmark::RunSpecifiedBenchmarks();
  return 0;
}
