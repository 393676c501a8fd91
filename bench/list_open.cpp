// SPDX-License-Identifier: GPL-3.0-or-later
// Opens one folder in a window and prints how long it took from the start of the process to the first painted rows, how much
// memory the process holds then, and how long the main loop was blocked at most until everything visible was there.
//   list_open FOLDER [--grid] [--stay SECONDS] [--scroll] [--edit]
#include <unistd.h>

#include <algorithm>
#include <cstdio>
#include <cstdlib>
#include <cstring>
#include <fstream>
#include <memory>
#include <string>

#include "host/gtk/list/folder_view.h"

namespace {

double now() { return static_cast<double>(g_get_monotonic_time()) / 1000; }

/// When the process began, in milliseconds of the clock of now(). The kernel's own record is too coarse, so the program
/// notes the time and starts itself once more, which costs what starting costs.
double processStart(char** argv) {
  constexpr const char* variable = "LIST_OPEN_START";
  if (const char* start = std::getenv(variable)) return std::strtod(start, nullptr);
  setenv(variable, std::to_string(now()).c_str(), 1);
  execv("/proc/self/exe", argv);
  return now();
}

long residentKibibytes() {
  std::ifstream file("/proc/self/statm");
  long total = 0;
  long resident = 0;
  file >> total >> resident;
  return resident * (sysconf(_SC_PAGESIZE) / 1024);
}

struct Run {
  std::string folder;
  bool grid = false;
  bool scroll = false;
  bool edit = false;
  double stay = 1;
  double start = 0;
  double main = now();
  double begunTurn = 0;
  double longestBlock = 0;
  double longestAfter = 0;
  bool painted = false;
  bool haveItems = false;
  double steps = 0;
  std::unique_ptr<vaelo::FolderView> view;
};

Run* run;
GPollFunc waitForEvents;

int measuredPoll(GPollFD* fds, guint count, int timeout) {
  if (run->begunTurn > 0) {
    const double took = now() - run->begunTurn;
    double& longest = run->painted ? run->longestAfter : run->longestBlock;
    longest = std::max(longest, took);
  }
  const int result = waitForEvents(fds, count, timeout);
  run->begunTurn = now();
  return result;
}

void painted() {
  if (!run->haveItems || run->painted) return;
  std::printf("painted_ms=%.1f from_main_ms=%.1f items=%zu block_before_ms=%.1f\n", now() - run->start, now() - run->main,
              run->view->itemCount(), run->longestBlock);
  run->painted = true;
}

void activate(GtkApplication* application) {
  std::printf("activate_ms=%.1f\n", now() - run->start);
  run->view = std::make_unique<vaelo::FolderView>();
  if (run->grid) run->view->setMode(vaelo::FolderView::Mode::Grid);
  run->view->setEvents({.activated = [](const std::string& name) { std::printf("activated %s\n", name.c_str()); },
                        .itemsChanged =
                            [] {
                              if (!run->haveItems) std::printf("items_ms=%.1f\n", now() - run->start);
                              run->haveItems = true;
                            },
                        .selectionChanged = nullptr,
                        .folderRemoved = [] { std::printf("removed\n"); },
                        .readFailed = [](int error) { std::printf("failed %s\n", std::strerror(error)); },
                        .refreshWanted = nullptr,
                        .commanded = nullptr,
                        .contextRequested = nullptr});
  run->view->setEditing(run->edit);
  run->view->setFolder(run->folder);
  GtkWidget* window = adw_application_window_new(application);
  gtk_window_set_default_size(GTK_WINDOW(window), 800, 700);
  adw_application_window_set_content(ADW_APPLICATION_WINDOW(window), run->view->widget());
  gtk_window_present(GTK_WINDOW(window));
  std::printf("presented_ms=%.1f\n", now() - run->start);
  g_signal_connect(gtk_widget_get_frame_clock(window), "after-paint", G_CALLBACK(painted), nullptr);
  if (run->scroll) {
    gtk_widget_add_tick_callback(
        window,
        [](GtkWidget*, GdkFrameClock*, gpointer) -> gboolean {
          if (run->painted) run->view->setScrollPosition(run->steps += 300);
          return G_SOURCE_CONTINUE;
        },
        nullptr, nullptr);
  }
  g_timeout_add(
      static_cast<guint>(run->stay * 1000),
      [](gpointer app) -> gboolean {
        std::printf("rss_kib=%ld items=%zu block_after_ms=%.1f\n", residentKibibytes(), run->view->itemCount(),
                    run->longestAfter);
        g_application_quit(G_APPLICATION(app));
        return G_SOURCE_REMOVE;
      },
      application);
}

}  // namespace

int main(int argc, char** argv) {
  Run theRun;
  run = &theRun;
  run->start = processStart(argv);
  for (int i = 1; i < argc; ++i) {
    const std::string argument = argv[i];
    if (argument == "--grid") {
      run->grid = true;
    } else if (argument == "--edit") {
      run->edit = true;
    } else if (argument == "--scroll") {
      run->scroll = true;
    } else if (argument == "--stay" && i + 1 < argc) {
      run->stay = std::strtod(argv[++i], nullptr);
    } else {
      run->folder = argument;
    }
  }
  if (run->folder.empty()) {
    std::fprintf(stderr, "usage: list_open FOLDER [--grid] [--stay SECONDS] [--scroll] [--edit]\n");
    return 2;
  }
  waitForEvents = g_main_context_get_poll_func(nullptr);
  g_main_context_set_poll_func(nullptr, measuredPoll);
  AdwApplication* application = adw_application_new("com.marrow.VaeloDrive.ListOpen", G_APPLICATION_NON_UNIQUE);
  g_signal_connect(application, "activate", G_CALLBACK(activate), nullptr);
  const int status = g_application_run(G_APPLICATION(application), 0, nullptr);
  run->view.reset();
  g_object_unref(application);
  return status;
}
