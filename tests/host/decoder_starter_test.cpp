// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/gtk/preview/decoder_starter.h"

#include <gdk-pixbuf/gdk-pixbuf.h>
#include <gtest/gtest.h>

#include <algorithm>
#include <csignal>
#include <optional>

#include "host/gtk/preview/decoder_process.h"
#include "tests/host/child_processes.h"
#include "tests/host/list_test_folder.h"

namespace vaelo {
namespace {

using list_test::waitUntil;

class DecoderStarterTest : public testing::Test {
 protected:
  static bool isRunning(const std::string& process) {
    const std::vector<std::string> all = childProcesses();
    return std::find(all.begin(), all.end(), process) != all.end();
  }
  /// The one that is started ahead.
  static std::string waiting() {
    const std::vector<std::string> before = childProcesses();
    const StartedDecoder used = takeStartedDecoder();
    if (!used.process) return "";
    std::string found;
    waitUntil([&] {
      g_main_context_wakeup(nullptr);
      for (const std::string& process : childProcesses()) {
        const bool isNew = std::find(before.begin(), before.end(), process) == before.end();
        if (isNew && process != g_subprocess_get_identifier(used.process.get())) found = process;
      }
      return !found.empty();
    });
    g_subprocess_force_exit(used.process.get());
    return found;
  }
};

TEST_F(DecoderStarterTest, OneIsStartedAheadAndTaken) {
  const std::string process = waiting();
  ASSERT_NE(process, "");
  const StartedDecoder taken = takeStartedDecoder();
  EXPECT_EQ(g_subprocess_get_identifier(taken.process.get()), process);
  g_subprocess_force_exit(taken.process.get());
}

TEST_F(DecoderStarterTest, OneThatEndedWhileItWaitedIsNotUsed) {
  const list_test::TestFolder folder;
  const std::string picture = folder.path() + "/a.png";
  const GRef<GdkPixbuf> pixbuf(gdk_pixbuf_new(GDK_COLORSPACE_RGB, FALSE, 8, 4, 4));
  ASSERT_TRUE(gdk_pixbuf_save(pixbuf.get(), picture.c_str(), "png", nullptr, nullptr));
  const std::string process = waiting();
  ASSERT_NE(process, "");
  ::kill(std::atoi(process.c_str()), SIGKILL);
  ASSERT_TRUE(waitUntil([&] {
    g_main_context_wakeup(nullptr);
    return !isRunning(process);
  }));
  std::optional<std::string> error;
  DecoderProcess decoder("picture", picture);
  decoder.ask("whole 10 10", [&](const DecoderProcess::Answer& answer) { error = answer.error; });
  ASSERT_TRUE(waitUntil([&] { return error.has_value(); }));
  EXPECT_EQ(*error, "");
}

}  // namespace
}  // namespace vaelo
