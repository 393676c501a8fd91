// SPDX-License-Identifier: GPL-3.0-or-later
// The details of a document with a thumbnail of 1024 pixels, from the tap to the first picture, beside the same thumbnail
// read from the desktop's cache and painted alone. Medians of taking turns.
//   details_open [ROUNDS]
#include <adwaita.h>

#include <algorithm>
#include <cstdio>
#include <cstdlib>
#include <filesystem>
#include <vector>

#include "app/nav_controller.h"
#include "host/desktop/restoration_store.h"
#include "host/gtk/gtk_application_loop.h"
#include "host/gtk/gtk_screens.h"
#include "host/gtk/mirror/view_mirror.h"
#include "host/gtk/thumbnails/thumbnail_cache.h"
#include "host/host_platform.h"
#include "host/support/glib_ptr.h"
#include "host/support/graphics_device.h"
#include "preview/preview_details_view_controller.h"
#include "preview/preview_item_manager.h"

namespace {

double now() { return static_cast<double>(g_get_monotonic_time()) / 1000; }

double median(std::vector<double> values) {
  std::sort(values.begin(), values.end());
  return values[values.size() / 2];
}

std::string temporaryFolder() {
  char name[] = "/tmp/vaelo-bench-XXXXXX";
  return mkdtemp(name);
}

struct World {
  World()
      : platform({folder + "/data", folder + "/preferences.ini", folder + "/restoration.ini"}),
        screens(platform.drive(), platform.syncedStore()),
        loop(screens, platform.drive(), platform.notifications(), platform.userActivities(),
             vaelo::RestorationStore(folder + "/restoration.ini")) {
    platform.install(loop, screens);
    // Noise, as photographs have: an even picture would be read at once.
    const vaelo::GRef<GdkPixbuf> picture(gdk_pixbuf_new(GDK_COLORSPACE_RGB, FALSE, 8, 1024, 768));
    guchar* pixels = gdk_pixbuf_get_pixels(picture.get());
    for (gsize i = 0; i < gdk_pixbuf_get_byte_length(picture.get()); ++i) pixels[i] = static_cast<guchar>(std::rand() % 64);
    photograph = folder + "/data/mirror/com~marrow~Kestrel/Photograph.png";
    gdk_pixbuf_save(picture.get(), photograph.c_str(), "png", nullptr, nullptr);
    modified =
        std::chrono::system_clock::to_time_t(std::chrono::file_clock::to_sys(std::filesystem::last_write_time(photograph)));
    const auto name = vaelo::thumbnailNameOf(photograph);
    const std::string place = vaelo::thumbnailFolderFor(cache(), 1024);
    std::filesystem::create_directories(place);
    vaelo::storeThumbnail(place + "/" + name->file, picture.get(), name->uri, modified);
    gtk_window_set_default_size(GTK_WINDOW(window), 800, 760);
    gtk_window_present(GTK_WINDOW(window));
    navigation->view();
  }
  ~World() {
    gtk_window_destroy(GTK_WINDOW(window));
    std::filesystem::remove_all(folder);
  }
  static std::string cache() { return g_get_user_cache_dir(); }

  void paint() {
    bool painted = false;
    GdkFrameClock* clock = gtk_widget_get_frame_clock(window);
    const gulong handler =
        g_signal_connect(clock, "after-paint", G_CALLBACK(+[](GdkFrameClock*, bool* flag) { *flag = true; }), &painted);
    gtk_widget_queue_draw(window);
    while (!painted) g_main_context_iteration(nullptr, TRUE);
    g_signal_handler_disconnect(clock, handler);
  }
  void showNothing() {
    gtk_window_set_child(GTK_WINDOW(window), gtk_label_new("Nothing"));
    paint();
    // A tap comes when the window is at rest: soon after a frame the next one would have to wait for its time.
    const double rested = now() + 50;
    while (now() < rested) {
      if (!g_main_context_iteration(nullptr, FALSE)) g_usleep(1000);
    }
  }

  double details() {
    const double begun = now();
    const auto manager = vaelo::PreviewItemManager::newItemManagerWithModeNavController(1, navigation);
    const vaelo::ViewControllerRef screen =
        manager->prepareToPreviewItem(vaelo::DRItem::initWithURL(vaelo::URL(photograph)));
    navigation->pushViewController(screen, false);
    vaelo::ViewMirror mirror(screen->view());
    gtk_window_set_child(GTK_WINDOW(window), mirror.widget());
    paint();
    const double took = now() - begun;
    const auto* shown = dynamic_cast<vaelo::PreviewDetailsViewController*>(screen.get());
    if (!shown || shown->thumbnailView()->isGenericImage()) std::fprintf(stderr, "the thumbnail is missing\n");
    gtk_window_set_child(GTK_WINDOW(window), nullptr);
    navigation->setViewControllers({}, false);
    return took;
  }
  double bare() {
    const double begun = now();
    const vaelo::GRef<GdkTexture> texture(vaelo::cachedThumbnail(cache(), photograph, modified, 1024));
    gtk_window_set_child(GTK_WINDOW(window), gtk_picture_new_for_paintable(GDK_PAINTABLE(texture.get())));
    paint();
    return now() - begun;
  }

  std::string folder = temporaryFolder();
  std::string photograph;
  std::int64_t modified = 0;
  vaelo::HostPlatform platform;
  vaelo::GtkScreens screens;
  vaelo::GtkApplicationLoop loop;
  std::shared_ptr<vaelo::NavController> navigation = std::make_shared<vaelo::NavController>();
  GtkWidget* window = gtk_window_new();
};

}  // namespace

int main(int argc, char** argv) {
  const int rounds = argc > 1 ? std::max(std::atoi(argv[1]), 1) : 21;
  const std::string caches = temporaryFolder();
  g_setenv("XDG_CACHE_HOME", caches.c_str(), TRUE);
  vaelo::drawWithoutGLWhereItIsEmulated();
  adw_init();
  {
    World world;
    std::vector<double> details;
    std::vector<double> bare;
    for (int round = 0; round <= rounds; ++round) {
      world.showNothing();
      const double first = world.details();
      world.showNothing();
      const double second = world.bare();
      if (round == 0) continue;  // in which fonts and icons are loaded
      details.push_back(first);
      bare.push_back(second);
    }
    std::printf("details %.1f ms, thumbnail alone %.1f ms, ratio %.2f\n", median(details), median(bare),
                median(details) / median(bare));
  }
  std::filesystem::remove_all(caches);
  return 0;
}
