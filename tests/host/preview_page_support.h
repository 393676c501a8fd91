// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <adwaita.h>

#include <memory>
#include <string>

#include "host/gtk/gtk_screens.h"
#include "host/gtk/preview/preview_page.h"
#include "host/host_platform.h"
#include "tests/host/drive_test_support.h"

namespace vaelo::preview_test {

/// A page needs services, but no application that runs.
class NoApplication : public Application {
 public:
  int run(int, char**, std::function<std::shared_ptr<ApplicationDelegate>()>) override { return 0; }
  bool isRightToLeft() override { return false; }
  std::string description() override { return ""; }
};

class OneDocument : public PreviewControllerDataSource {
 public:
  explicit OneDocument(const std::string& path) : url_(path) {}
  void pointTo(const std::string& path) { url_ = URL(path); }
  std::size_t numberOfPreviewItemsInPreviewController(PreviewController&) override { return 1; }
  URL previewControllerPreviewItemAtIndex(PreviewController&, std::size_t) override { return url_; }

 private:
  URL url_;
};

/// Title and description of the first status page that is mapped in `widget`; empty when there is none.
inline std::string wordsShownIn(GtkWidget* widget) {
  if (!gtk_widget_get_mapped(widget)) return "";
  if (ADW_IS_STATUS_PAGE(widget)) {
    const char* text = adw_status_page_get_description(ADW_STATUS_PAGE(widget));
    return std::string(adw_status_page_get_title(ADW_STATUS_PAGE(widget))) + "\n" + (text ? text : "");
  }
  for (GtkWidget* child = gtk_widget_get_first_child(widget); child; child = gtk_widget_get_next_sibling(child)) {
    const std::string found = wordsShownIn(child);
    if (!found.empty()) return found;
  }
  return "";
}

/// A preview's page in a window, with the real platform's services on a drive of its own.
class PreviewPageTest : public drive_test::DriveTest {
 protected:
  void SetUp() override {
    if (!gtk_init_check()) GTEST_SKIP() << "no display";
    adw_init();
    platform = std::make_unique<HostPlatform>(HostFolders{data, root + "/preferences.ini", root + "/restoration.ini"});
    screens = std::make_unique<GtkScreens>(platform->drive(), platform->syncedStore());
    platform->install(application, *screens);
    window = gtk_window_new();
    gtk_window_set_default_size(GTK_WINDOW(window), 400, 500);
    gtk_window_present(GTK_WINDOW(window));
  }
  void TearDown() override {
    if (!window) return;
    gtk_window_destroy(GTK_WINDOW(window));
    page.reset();
    controller.reset();
  }
  void show(const std::string& path, std::chrono::milliseconds patience = PreviewedDocument().patience) {
    source = std::make_shared<OneDocument>(path);
    controller = std::make_shared<PreviewController>();
    controller->setDataSource(source);
    page = std::make_unique<PreviewPage>(
        controller, [] {}, patience);
    gtk_window_set_child(GTK_WINDOW(window), page->widget());
  }
  std::string said() const { return wordsShownIn(window); }

  std::unique_ptr<HostPlatform> platform;
  std::unique_ptr<GtkScreens> screens;
  NoApplication application;
  GtkWidget* window = nullptr;
  std::shared_ptr<OneDocument> source;
  std::shared_ptr<PreviewController> controller;
  std::unique_ptr<PreviewPage> page;
};

}  // namespace vaelo::preview_test
