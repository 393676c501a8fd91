// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <gtest/gtest.h>

#include "host/gtk/preview/portable_document_screen.h"
#include "tests/host/preview_portable_document_support.h"

namespace vaelo::portable_document_test {

/// Real documents in the real decoder's process, in a window; the document is "a.pdf".
class ScreenTest : public testing::Test {
 protected:
  void SetUp() override {
    if (!gtk_init_check()) GTEST_SKIP() << "no display";
    adw_init();
    window_ = gtk_window_new();
    gtk_window_set_default_size(GTK_WINDOW(window_), 424, 700);
    toasts_ = adw_toast_overlay_new();
    gtk_window_set_child(GTK_WINDOW(window_), toasts_);
    gtk_window_present(GTK_WINDOW(window_));
  }
  void TearDown() override {
    close();
    PortableDocumentMarks::finishAll();
    if (window_) gtk_window_destroy(GTK_WINDOW(window_));
  }

  std::string path() const { return folder_.path() + "/a.pdf"; }

  void open(bool mayBeEdited = false) {
    shown_ = 0;
    PreviewedDocument document{path(), "a.pdf", "application/pdf", mayBeEdited};
    DocumentViewEvents events;
    events.shown = [this] { ++shown_; };
    events.failed = [this](const std::string& sentence) { failure_ = sentence; };
    events.shouldSave = [this] {
      ++asked_;
      return maySave_;
    };
    screen_ = std::make_unique<PortableDocumentScreen>(document, std::move(events));
    adw_toast_overlay_set_child(ADW_TOAST_OVERLAY(toasts_), screen_->widget());
    ASSERT_TRUE(waitUntil([this] { return (shown_ > 0 && screen_->canvas().height() > 0) || !failure_.empty(); }));
  }
  void close() {
    if (toasts_) adw_toast_overlay_set_child(ADW_TOAST_OVERLAY(toasts_), nullptr);
    screen_.reset();
  }

  /// Where a place on a page, in points, is on the canvas.
  std::pair<double, double> at(int page, double x, double y) {
    const PageArea area = screen_->canvas().areaOf(page);
    return {area.x + x * screen_->canvas().zoom(), area.y + y * screen_->canvas().zoom()};
  }
  /// Presses at one place and lets go at another, as a pointer does.
  void dragFrom(std::pair<double, double> from, std::pair<double, double> to, int presses = 1) {
    screen_->press(from.first, from.second, presses);
    screen_->drag((from.first + to.first) / 2, (from.second + to.second) / 2);
    screen_->drag(to.first, to.second);
    screen_->release(false);
  }
  std::string clipboard() {
    struct Read {
      bool done = false;
      std::string text;
    } read;
    gdk_clipboard_read_text_async(
        gtk_widget_get_clipboard(window_), nullptr,
        [](GObject* source, GAsyncResult* result, gpointer data) {
          auto* into = static_cast<Read*>(data);
          into->text = takeString(gdk_clipboard_read_text_finish(GDK_CLIPBOARD(source), result, nullptr));
          into->done = true;
        },
        &read);
    list_test::waitUntil([&] { return read.done; });
    return read.text;
  }
  bool waitUntil(const std::function<bool()>& happened) { return list_test::waitUntil(happened); }

  list_test::TestFolder folder_;
  GtkWidget* window_ = nullptr;
  GtkWidget* toasts_ = nullptr;
  std::unique_ptr<PortableDocumentScreen> screen_;
  int shown_ = 0;
  std::string failure_;
  bool maySave_ = true;
  int asked_ = 0;
};

}  // namespace vaelo::portable_document_test
