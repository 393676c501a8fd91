// SPDX-License-Identifier: GPL-3.0-or-later
#include <glib.h>
#include <gtest/gtest.h>

#include <algorithm>

#include "host/files/glib_log.h"

namespace vaelo {

namespace {

/// The library takes no more of this once there is a thread, of which tests before these may have made one.
const GLibLog beforeAnyThread;

class FilesLogTest : public testing::Test {
 protected:
  FilesLogTest() { g_unsetenv("G_MESSAGES_DEBUG"); }
  ~FilesLogTest() override { g_unsetenv("G_MESSAGES_DEBUG"); }
  static std::size_t linesIn(const std::string& text) {
    return static_cast<std::size_t>(std::count(text.begin(), text.end(), '\n'));
  }
  GLibLog log;
};

TEST_F(FilesLogTest, LinesComeInOrderAndNothingEndsTheProgram) {
  testing::internal::CaptureStderr();
  log.write(LogType::Error, "(VLO)[ERROR] first");
  log.write(LogType::Default, "(VLO)[INFO] 100% %s second");
  const std::string text = testing::internal::GetCapturedStderr();
  EXPECT_NE(text.find("(VLO)[ERROR] first"), std::string::npos);
  EXPECT_NE(text.find("100% %s second"), std::string::npos);
  EXPECT_LT(text.find("first"), text.find("second"));
}

TEST_F(FilesLogTest, DebugLinesAreShownToWhoAsks) {
  EXPECT_FALSE(log.wantsDebug());
  testing::internal::CaptureStderr();
  log.write(LogType::Debug, "hidden");
  g_setenv("G_MESSAGES_DEBUG", "vaelo-drive", TRUE);
  EXPECT_TRUE(log.wantsDebug());
  log.write(LogType::Debug, "shown");
  GLibActivityTracing().recordUserAction("Pressed Move");
  const std::string text = testing::internal::GetCapturedStderr();
  EXPECT_EQ(text.find("hidden"), std::string::npos);
  EXPECT_NE(text.find("shown"), std::string::npos);
  EXPECT_NE(text.find("Pressed Move"), std::string::npos);
}

TEST_F(FilesLogTest, ANameCannotForgeALine) {
  testing::internal::CaptureStderr();
  log.write(LogType::Default, "plain");
  const std::size_t lines = linesIn(testing::internal::GetCapturedStderr());
  testing::internal::CaptureStderr();
  log.write(LogType::Default, "name \xff\n(VLO)[ERROR] forged\r");
  const std::string text = testing::internal::GetCapturedStderr();
  EXPECT_EQ(linesIn(text), lines);
  EXPECT_TRUE(g_utf8_validate(text.c_str(), -1, nullptr));
}

}  // namespace

}  // namespace vaelo
