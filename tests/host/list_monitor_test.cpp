// SPDX-License-Identifier: GPL-3.0-or-later
#include <gtest/gtest.h>

#include <algorithm>
#include <set>

#include "host/drive/promise_file.h"
#include "host/gtk/list/folder_monitor.h"
#include "tests/host/list_test_folder.h"

namespace vaelo {
namespace {

using list_test::TestFolder;
using list_test::waitUntil;

class FolderMonitorTest : public testing::Test {
 protected:
  void watch() {
    monitor_.start(
        folder_.path(),
        [this](FolderChanges changes) {
          ++reports_;
          everything_ |= changes.everything;
          names_.insert(changes.names.begin(), changes.names.end());
        },
        [this] { removed_ = true; });
  }

  TestFolder folder_;
  FolderMonitor monitor_;
  std::set<std::string> names_;
  bool everything_ = false;
  bool removed_ = false;
  int reports_ = 0;
};

TEST_F(FolderMonitorTest, NamesWhatCameWentAndChanged) {
  folder_.write("old");
  folder_.write("changed");
  watch();
  folder_.write("new");
  folder_.write(".hidden");
  folder_.remove("old");
  folder_.write("changed", "more");
  std::filesystem::rename(folder_.path() + "/new", folder_.path() + "/renamed");
  PromiseInfo info;
  info.name = "promised";
  ASSERT_FALSE(writePromise(folder_.path(), info));
  ASSERT_TRUE(waitUntil([&] { return names_.contains("promised"); }));
  EXPECT_EQ(names_, (std::set<std::string>{"old", "changed", "new", "renamed", "promised"}));
  EXPECT_FALSE(everything_);
}

TEST_F(FolderMonitorTest, ManyChangesAreOneReport) {
  watch();
  for (int i = 0; i < 500; ++i) folder_.write("file " + std::to_string(i));
  ASSERT_TRUE(waitUntil([&] { return names_.size() == 500; }));
  EXPECT_LE(reports_, 3);
}

TEST_F(FolderMonitorTest, StormAsksForANewReading) {
  watch();
  for (int i = 0; i < 3000; ++i) folder_.write("file " + std::to_string(i));
  EXPECT_TRUE(waitUntil([&] { return everything_; }));
}

TEST_F(FolderMonitorTest, TellsOfTheFoldersOwnRemoval) {
  watch();
  std::filesystem::remove(folder_.path());
  EXPECT_TRUE(waitUntil([&] { return removed_; }));
}

}  // namespace
}  // namespace vaelo
