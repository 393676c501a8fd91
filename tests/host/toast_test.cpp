// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/gtk/toast.h"

#include <gtest/gtest.h>

#include "tests/host/list_test_folder.h"

namespace vaelo {

namespace {

using list_test::waitUntil;

constexpr int WindowHeight = 400;

class ToastTest : public ::testing::Test {
 protected:
  ToastTest() {
    gtk_window_set_child(window_, GTK_WIDGET(toasts_));
    adw_toast_overlay_set_child(toasts_, gtk_box_new(GTK_ORIENTATION_VERTICAL, 0));
    setToastRoom(toasts_, [this] { return room_; });
  }
  ~ToastTest() override { gtk_window_destroy(window_); }

  GtkLabel* show(const std::string& text, ToastRoom room, const char* button = nullptr) {
    room_ = room;
    gtk_window_set_default_size(window_, room.width, WindowHeight);
    gtk_window_present(window_);
    AdwToast* toast = makeToast(text, button);
    adw_toast_set_timeout(toast, 0);
    auto* label = GTK_LABEL(adw_toast_get_custom_title(toast));
    adw_toast_overlay_add_toast(toasts_, toast);
    return label;
  }
  /// Where its lower edge is; it slides in from below the window, up to its place.
  int bottomOf(GtkLabel* label) const {
    graphene_rect_t bounds;
    GtkWidget* toast = GTK_WIDGET(label);
    while (toast && gtk_widget_get_parent(toast) != GTK_WIDGET(toasts_)) toast = gtk_widget_get_parent(toast);
    const bool placed =
        toast && gtk_widget_get_height(toast) > 0 && gtk_widget_compute_bounds(toast, GTK_WIDGET(toasts_), &bounds);
    return placed ? static_cast<int>(bounds.origin.y + bounds.size.height) : 2 * WindowHeight;
  }
  bool comesAbove(GtkLabel* label, int edge) const {
    return waitUntil([&] { return bottomOf(label) <= edge; });
  }
  int linesOf(GtkLabel* label) const {
    if (!comesAbove(label, WindowHeight)) return 0;
    return pango_layout_get_line_count(gtk_label_get_layout(label));
  }

  GtkWindow* const window_ = (adw_init(), GTK_WINDOW(gtk_window_new()));
  AdwToastOverlay* const toasts_ = ADW_TOAST_OVERLAY(adw_toast_overlay_new());
  ToastRoom room_;
};

constexpr const char* Sentence = "Moved “Minutes of the garden.txt” to “Documents”";

TEST_F(ToastTest, ASentenceIsOneLineWhereThereIsRoomForIt) { EXPECT_EQ(linesOf(show(Sentence, {1280, 0}, "Undo")), 1); }

TEST_F(ToastTest, OnAPhoneItBreaksAndFits) {
  GtkLabel* label = show(Sentence, {360, 0}, "Undo");
  EXPECT_GT(linesOf(label), 1);
  graphene_rect_t bounds;
  ASSERT_TRUE(gtk_widget_compute_bounds(GTK_WIDGET(label), GTK_WIDGET(toasts_), &bounds));
  EXPECT_GE(bounds.origin.x, 0);
  EXPECT_LE(bounds.origin.x + bounds.size.width, 360);
}

TEST_F(ToastTest, ItStandsAboveTheBar) {
  GtkLabel* label = show("Link copied", {360, 60});
  ASSERT_TRUE(comesAbove(label, WindowHeight - 60));
  EXPECT_GT(bottomOf(label), WindowHeight - 120);
}

TEST_F(ToastTest, ItFollowsTheRoom) {
  GtkLabel* label = show(Sentence, {1280, 0}, "Undo");
  EXPECT_EQ(linesOf(label), 1);
  room_ = {1280, 60};
  fitToasts(toasts_);
  EXPECT_TRUE(comesAbove(label, WindowHeight - 60));
  room_ = {360, 60};
  fitToasts(toasts_);
  EXPECT_TRUE(waitUntil([&] { return linesOf(label) > 1; }));
}

}  // namespace

}  // namespace vaelo
