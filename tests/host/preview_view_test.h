// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <adwaita.h>
#include <gtest/gtest.h>

#include <memory>
#include <string>

#include "host/gtk/preview/document_view.h"
#include "tests/host/list_test_folder.h"
#include "tests/support/memory_platform.h"

namespace vaelo::preview_test {

/// Shows a document of a folder in a window, by the view that the table of kinds has for it.
class PreviewViewTest : public testing::Test {
 protected:
  void SetUp() override {
    if (!gtk_init_check()) GTEST_SKIP() << "no display";
    adw_init();
    window_ = gtk_window_new();
    gtk_window_set_default_size(GTK_WINDOW(window_), 400, 600);
    gtk_window_present(GTK_WINDOW(window_));
  }
  void TearDown() override {
    if (!window_) return;
    leave();
    gtk_window_destroy(GTK_WINDOW(window_));
  }
  void leave() {
    gtk_window_set_child(GTK_WINDOW(window_), nullptr);
    view_.reset();
  }
  std::string pathOf(const std::string& name) const { return folder_.path() + "/" + name; }
  /// Without waiting for anything.
  void begin(const std::string& name, const std::string& type) {
    leave();
    shown_ = 0;
    failure_.clear();
    progress_.clear();
    DocumentViewEvents events;
    events.shown = [this] { ++shown_; };
    events.failed = [this](const std::string& sentence) { failure_ = sentence; };
    events.progress = [this](const std::string& sentence) { progress_ = sentence; };
    view_ = makeDocumentView({pathOf(name), name, type, false}, std::move(events));
    ASSERT_NE(view_, nullptr) << type;
    gtk_window_set_child(GTK_WINDOW(window_), view_->widget());
  }
  void open(const std::string& name, const std::string& type) {
    begin(name, type);
    if (!view_) return;
    ASSERT_TRUE(list_test::waitUntil([this] { return shown_ > 0 || !failure_.empty(); })) << name;
  }
  /// The texts of the labels that show below `widget`, a line each.
  static std::string labelsIn(GtkWidget* widget) {
    if (!gtk_widget_get_child_visible(widget) || !gtk_widget_get_visible(widget)) return "";
    if (GTK_IS_LABEL(widget)) return std::string(gtk_label_get_text(GTK_LABEL(widget))) + "\n";
    std::string all;
    for (GtkWidget* child = gtk_widget_get_first_child(widget); child; child = gtk_widget_get_next_sibling(child)) {
      all += labelsIn(child);
    }
    return all;
  }
  /// The first widget of the type below `widget`; null when there is none.
  static GtkWidget* findIn(GtkWidget* widget, GType type) {
    if (g_type_is_a(G_OBJECT_TYPE(widget), type)) return widget;
    for (GtkWidget* child = gtk_widget_get_first_child(widget); child; child = gtk_widget_get_next_sibling(child)) {
      if (GtkWidget* found = findIn(child, type)) return found;
    }
    return nullptr;
  }

  MemoryPlatform platform_;
  list_test::TestFolder folder_;
  GtkWidget* window_ = nullptr;
  std::unique_ptr<DocumentView> view_;
  int shown_ = 0;
  std::string failure_;
  std::string progress_;
};

}  // namespace vaelo::preview_test
