// SPDX-License-Identifier: GPL-3.0-or-later
// A preview's page in a window, with the real platform below it, for the programs that time previews.
#pragma once

#include <adwaita.h>
#include <malloc.h>
#include <unistd.h>

#include <algorithm>
#include <fstream>
#include <functional>
#include <memory>
#include <string>
#include <vector>

#include "host/gtk/gtk_screens.h"
#include "host/gtk/preview/preview_page.h"
#include "host/gtk/scrolled_windows.h"
#include "host/host_platform.h"
#include "host/support/graphics_device.h"

namespace vaelo::bench {

inline double now() { return static_cast<double>(g_get_monotonic_time()) / 1000; }

inline double median(std::vector<double> values) {
  std::sort(values.begin(), values.end());
  return values[values.size() / 2];
}

struct Held {
  long allocated;  // of all arenas
  long resident;   // without what the allocator keeps for later
};

inline Held heldKibibytes() {
  ::malloc_trim(0);
  const struct ::mallinfo2 info = ::mallinfo2();
  std::ifstream file("/proc/self/statm");
  long total = 0;
  long resident = 0;
  file >> total >> resident;
  return {static_cast<long>((info.uordblks + info.hblkhd) / 1024), resident * (::sysconf(_SC_PAGESIZE) / 1024)};
}

class PreviewWindow : public PreviewControllerDataSource, public std::enable_shared_from_this<PreviewWindow> {
 public:
  /// `folder` gets the platform's own files.
  static std::shared_ptr<PreviewWindow> open(const std::string& folder) {
    drawWithoutGLWhereItIsEmulated();
    g_setenv("XDG_DATA_HOME", (folder + "/share").c_str(), TRUE);
    gtk_init();
    adw_init();
    mendScrolledWindows();
    std::shared_ptr<PreviewWindow> window(new PreviewWindow(folder));
    window->controller_->setDataSource(window);
    window->page_ = std::make_unique<PreviewPage>(window->controller_, [] {});
    window->showPage();
    window->paint();
    return window;
  }
  ~PreviewWindow() override { gtk_window_destroy(GTK_WINDOW(window_)); }

  /// From the tap on: until the first screen of the document is painted, in milliseconds.
  double show(const std::string& path) {
    rest();
    const double begun = now();
    items_ = {URL(path)};
    controller_->reloadData();
    untilPainted([this] { return isShown(); });
    return now() - begun;
  }
  void showNothing() {
    items_.clear();
    controller_->reloadData();
    paint();
  }
  /// Until what was asked for by now is painted.
  void paint() {
    gtk_widget_queue_draw(window_);
    untilPainted([] { return true; });
  }
  /// A tap comes when the window is at rest: soon after a frame the next one would have to wait for its time.
  static void rest() { run(50); }
  static void run(double milliseconds) {
    const double end = now() + milliseconds;
    const guint waking = g_timeout_add(
        5, [](gpointer) -> gboolean { return G_SOURCE_CONTINUE; }, nullptr);
    while (now() < end) g_main_context_iteration(nullptr, TRUE);
    g_source_remove(waking);
  }
  /// Something else in the window, for comparison.
  void showOther(GtkWidget* child) { gtk_window_set_child(GTK_WINDOW(window_), child); }
  void showPage() { gtk_window_set_child(GTK_WINDOW(window_), page_->widget()); }
  GtkWidget* shownView() const { return gtk_stack_get_visible_child(GTK_STACK(page_->widget())); }

  static constexpr int Width = 800;
  static constexpr int Height = 760;

 private:
  class NoApplication : public Application {
   public:
    int run(int, char**, std::function<std::shared_ptr<ApplicationDelegate>()>) override { return 0; }
    bool isRightToLeft() override { return false; }
    std::string description() override { return ""; }
  };

  explicit PreviewWindow(const std::string& folder)
      : platform_({folder + "/data", folder + "/preferences.ini", folder + "/restoration.ini"}),
        screens_(platform_.drive(), platform_.syncedStore()),
        window_(gtk_window_new()),
        controller_(std::make_shared<PreviewController>()) {
    platform_.install(application_, screens_);
    gtk_window_set_default_size(GTK_WINDOW(window_), Width, Height);
    gtk_window_present(GTK_WINDOW(window_));
  }

  /// Until a frame is painted of which that is true.
  void untilPainted(const std::function<bool()>& isMeant) {
    struct Wait {
      const std::function<bool()>& isMeant;
      bool isOver;
    } wait{isMeant, false};
    GdkFrameClock* clock = gtk_widget_get_frame_clock(window_);
    const gulong handler = g_signal_connect(
        clock, "after-paint", G_CALLBACK(+[](GdkFrameClock*, Wait* self) { self->isOver = self->isMeant(); }), &wait);
    while (!wait.isOver) g_main_context_iteration(nullptr, TRUE);
    g_signal_handler_disconnect(clock, handler);
  }

  // Of the page's own places each has a name.
  bool isShown() const {
    GtkStack* stack = GTK_STACK(page_->widget());
    return !gtk_stack_page_get_name(gtk_stack_get_page(stack, gtk_stack_get_visible_child(stack)));
  }

  std::size_t numberOfPreviewItemsInPreviewController(PreviewController&) override { return items_.size(); }
  URL previewControllerPreviewItemAtIndex(PreviewController&, std::size_t index) override { return items_.at(index); }

  HostPlatform platform_;
  GtkScreens screens_;
  NoApplication application_;
  GtkWidget* window_;
  std::vector<URL> items_;
  std::shared_ptr<PreviewController> controller_;
  std::unique_ptr<PreviewPage> page_;
};

}  // namespace vaelo::bench
