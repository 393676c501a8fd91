// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/gtk/keyboard_area.h"

#include <adwaita.h>
#include <gtest/gtest.h>

#include "platform/ui/keyboard_notice.h"

namespace vaelo {
namespace {

class KeyboardAreaTest : public testing::Test {
 protected:
  KeyboardAreaTest() {
    for (const char* name : {KeyboardWillShowNotification, KeyboardWillHideNotification}) {
      tokens.push_back(notifications.addObserver(name, [this](const Notification& told) {
        heard.push_back(told.name + " " + std::to_string(static_cast<int>(KeyboardNotice::from(told).beginFrame.height)));
      }));
    }
    gtk_window_set_child(GTK_WINDOW(window), entry);
    area.windowResized(360, 720);
  }
  ~KeyboardAreaTest() override { gtk_window_destroy(GTK_WINDOW(window)); }

  NotificationCenter notifications;
  std::vector<NotificationCenter::Token> tokens;
  std::vector<std::string> heard;
  GtkWidget* window = (adw_init(), gtk_window_new());
  GtkWidget* entry = gtk_entry_new();
  KeyboardArea area{GTK_WINDOW(window), notifications};
};

TEST_F(KeyboardAreaTest, AWindowThatGetsLowerWhileATextIsEditedHasAKeyboardBelow) {
  gtk_widget_grab_focus(entry);
  EXPECT_EQ(area.windowResized(360, 450), 720);
  EXPECT_EQ(heard, std::vector<std::string>{"KeyboardWillShowNotification 270"});
  EXPECT_EQ(area.windowResized(360, 460), 720);
  EXPECT_EQ(heard.size(), 1U);
  EXPECT_EQ(area.windowResized(360, 720), 720);
  EXPECT_EQ(heard.back(), "KeyboardWillHideNotification 260");
}

TEST_F(KeyboardAreaTest, ALowWindowInWhichNoTextIsEditedAnyMoreIsThatLow) {
  gtk_widget_grab_focus(entry);
  area.windowResized(360, 450);
  gtk_window_set_focus(GTK_WINDOW(window), nullptr);
  EXPECT_EQ(area.windowResized(360, 450), 720) << "the keyboard is about to go";
  EXPECT_EQ(heard.size(), 1U);
  EXPECT_EQ(area.windowResized(360, 440), 440);
  EXPECT_EQ(heard.back(), "KeyboardWillHideNotification 270");
}

TEST_F(KeyboardAreaTest, ItGoesWhenTheDeviceIsTurned) {
  gtk_widget_grab_focus(entry);
  area.windowResized(360, 450);
  EXPECT_EQ(area.windowResized(720, 360), 360);
  ASSERT_EQ(heard.size(), 2U);
  EXPECT_EQ(heard.back(), "KeyboardWillHideNotification 270");
}

TEST_F(KeyboardAreaTest, OtherSizesAreNoKeyboard) {
  EXPECT_EQ(area.windowResized(360, 450), 450);
  gtk_widget_grab_focus(entry);
  EXPECT_EQ(area.windowResized(360, 400), 400);
  area.windowResized(720, 200);
  EXPECT_TRUE(heard.empty());
}

}  // namespace
}  // namespace vaelo
