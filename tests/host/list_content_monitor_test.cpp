// SPDX-License-Identifier: GPL-3.0-or-later
#include <gtest/gtest.h>

#include <map>

#include "host/gtk/list/content_monitor.h"
#include "tests/host/list_test_folder.h"

namespace vaelo {
namespace {

using list_test::TestFolder;
using list_test::waitUntil;

class ContentMonitorTest : public testing::Test {
 protected:
  void watch(const std::string& name) {
    monitor_.add(monitor_.queue(), monitor_.queue()->watch(folder_.path() + "/" + name), name);
  }
  bool told(const std::string& name) {
    return waitUntil([&] { return told_[name] > 0; });
  }

  TestFolder folder_;
  std::map<std::string, int> told_;
  ContentMonitor monitor_{[this](const std::string& key) { ++told_[key]; }};
};

TEST_F(ContentMonitorTest, TellsInWhichFolderItemsCameOrWent) {
  for (const char* name : {"a", "b", "c"}) {
    folder_.makeFolder(name);
    folder_.write(name + std::string("/old"));
    watch(name);
  }
  folder_.write("a/new");
  folder_.remove("b/old");
  folder_.write("c/old", "other words");
  EXPECT_TRUE(told("a"));
  EXPECT_TRUE(told("b"));
  EXPECT_EQ(told_["c"], 0);
}

TEST_F(ContentMonitorTest, ManyItemsAreToldAtOnce) {
  folder_.makeFolder("a");
  watch("a");
  for (int i = 0; i < 1000; ++i) folder_.write("a/" + std::to_string(i));
  ASSERT_TRUE(told("a"));
  EXPECT_LE(told_["a"], 2);
}

TEST_F(ContentMonitorTest, TellsThatAFolderIsGone) {
  folder_.makeFolder("a");
  watch("a");
  folder_.remove("a");
  EXPECT_TRUE(told("a"));
  EXPECT_EQ(monitor_.size(), 0U);
}

// A folder is watched on a thread, and known here somewhat later.
TEST_F(ContentMonitorTest, WhatHappensBeforeAFolderIsAddedIsTold) {
  folder_.makeFolder("early");
  folder_.makeFolder("a");
  const int early = monitor_.queue()->watch(folder_.path() + "/early");
  watch("a");
  folder_.write("early/new");
  folder_.write("a/new");
  ASSERT_TRUE(told("a"));
  EXPECT_EQ(told_["early"], 0);
  monitor_.add(monitor_.queue(), early, "early");
  EXPECT_TRUE(told("early"));
}

TEST_F(ContentMonitorTest, ForgetsFoldersThatNobodyWants) {
  folder_.makeFolder("a");
  folder_.makeFolder("b");
  watch("a");
  watch("b");
  monitor_.keep([](const std::string& key) { return key == "b"; });
  EXPECT_EQ(monitor_.size(), 1U);
  folder_.write("a/new");
  folder_.write("b/new");
  EXPECT_TRUE(told("b"));
  EXPECT_EQ(told_["a"], 0);
}

TEST_F(ContentMonitorTest, BeginsAnewAfterItWasStopped) {
  folder_.makeFolder("a");
  folder_.makeFolder("b");
  const auto before = monitor_.queue();
  const int late = before->watch(folder_.path() + "/a");
  watch("a");
  monitor_.stop();
  EXPECT_EQ(monitor_.size(), 0U);
  watch("b");
  monitor_.add(before, late, "a");
  EXPECT_EQ(monitor_.size(), 1U) << "its number is another folder's now";
  folder_.write("a/new");
  folder_.write("b/new");
  EXPECT_TRUE(told("b"));
  EXPECT_EQ(told_["a"], 0);
}

TEST_F(ContentMonitorTest, AFolderThatCannotBeWatchedIsPassedOver) {
  watch("nowhere");
  folder_.write("file");
  watch("file");
  EXPECT_EQ(monitor_.size(), 0U);
}

}  // namespace
}  // namespace vaelo
