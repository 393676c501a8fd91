// SPDX-License-Identifier: GPL-3.0-or-later
#include <fcntl.h>
#include <glib.h>
#include <sys/file.h>
#include <sys/mount.h>
#include <unistd.h>

#include <cerrno>
#include <cstring>

#include "host/drive/mirror_walk.h"
#include "host/files/glib_queues.h"
#include "host/files/local_file_manager.h"
#include "host/files/tree_removals.h"
#include "host/support/unique_fd.h"
#include "tests/host/drive_test_support.h"

namespace vaelo {

namespace {

using Stage = TreeRemovals::Stage;

class FilesRemovalsTest : public drive_test::DriveTest {
 protected:
  FilesRemovalsTest() { makeFolder(drive); }
  ~FilesRemovalsTest() override { removals.reset(); }

  /// Large folders have ten items, and wait for as long as a test could take.
  void start(std::chrono::milliseconds wait = std::chrono::minutes(10)) {
    removals.reset();
    removals = std::make_unique<TreeRemovals>(place, log, queues, TreeRemovals::Timing{10, wait});
    removals->setObserver([this](const TreeRemovals::News& told) { news.push_back(told); });
  }
  void makeTree(const std::string& path, int files) {
    for (int i = 0; i < files; ++i) write(path + "/sub/" + std::to_string(i), std::to_string(i));
  }
  /// Runs the main loop until `done`, for ten seconds at most; other threads don't wake it.
  template <typename Condition>
  bool waitFor(Condition done) {
    bool late = false;
    const guint deadline = g_timeout_add_seconds(
        10, [](gpointer flag) -> gboolean { return *static_cast<bool*>(flag) = true; }, &late);
    const guint tick = g_timeout_add(
        1, [](gpointer) -> gboolean { return G_SOURCE_CONTINUE; }, nullptr);
    while (!done() && !late) g_main_context_iteration(nullptr, TRUE);
    g_source_remove(tick);
    g_source_remove(deadline);
    return !late;
  }
  bool told(Stage stage) const {
    return std::any_of(news.begin(), news.end(), [stage](const auto& each) { return each.stage == stage; });
  }
  /// How many files and folders lie in the place for what is on its way out, below the folders of the processes.
  std::size_t held() const {
    std::error_code failure;
    std::size_t count = 0;
    for (std::filesystem::recursive_directory_iterator entry(place, failure), end; !failure && entry != end;
         entry.increment(failure)) {
      count += entry.depth() > 0;
    }
    return count;
  }

  const std::string place = mirror + "/.vaelo/removing";
  GLibQueues queues;
  std::unique_ptr<TreeRemovals> removals;
  std::vector<TreeRemovals::News> news;
};

TEST_F(FilesRemovalsTest, AFolderLeavesItsPlaceAtOnceAndTheDiskSoon) {
  start();
  makeTree(drive + "/Photos", 5);
  LocalFileManager files(removals.get());
  EXPECT_FALSE(files.removeItemAtURL(URL(drive + "/Photos", true)));
  EXPECT_FALSE(exists(drive + "/Photos"));
  EXPECT_TRUE(waitFor([&] { return held() == 0; }));
  EXPECT_TRUE(news.empty()) << "nobody wants to hear of a small one";
}

TEST_F(FilesRemovalsTest, ALargeFolderIsToldOfAndGoesAfterItsTime) {
  start(std::chrono::milliseconds(1));
  makeTree(drive + "/Photos", 50);
  EXPECT_EQ(removals->remove(drive + "/Photos"), 0);
  ASSERT_TRUE(waitFor([&] { return told(Stage::Removed); }));
  EXPECT_EQ(news.front().stage, Stage::Waiting);
  EXPECT_EQ(news.front().name, "Photos");
  EXPECT_EQ(news.front().total, 52u);
  EXPECT_EQ(held(), 0u);
}

TEST_F(FilesRemovalsTest, ALargeFolderThatIsCancelledIsBackWhole) {
  start();
  makeTree(drive + "/Photos", 50);
  EXPECT_EQ(removals->remove(drive + "/Photos"), 0);
  ASSERT_TRUE(waitFor([&] { return told(Stage::Waiting); }));
  EXPECT_FALSE(exists(drive + "/Photos"));
  removals->cancel();
  ASSERT_TRUE(waitFor([&] { return told(Stage::PutBack); }));
  EXPECT_EQ(news.back().removed, 0u);
  for (int i = 0; i < 50; ++i) EXPECT_EQ(read(drive + "/Photos/sub/" + std::to_string(i)), std::to_string(i));
  EXPECT_EQ(held(), 0u);
}

TEST_F(FilesRemovalsTest, WhatIsPutBackReplacesNothing) {
  start();
  makeTree(drive + "/Photos", 50);
  EXPECT_EQ(removals->remove(drive + "/Photos"), 0);
  ASSERT_TRUE(waitFor([&] { return told(Stage::Waiting); }));
  write(drive + "/Photos/new");
  removals->cancel();
  ASSERT_TRUE(waitFor([&] { return told(Stage::PutBack); }));
  EXPECT_EQ(news.back().place, drive + "/Photos 2");
  EXPECT_EQ(read(drive + "/Photos 2/sub/7"), "7");
  EXPECT_TRUE(exists(drive + "/Photos/new"));
}

TEST_F(FilesRemovalsTest, WhatIsPutBackFindsItsFolderGone) {
  start();
  makeTree(drive + "/In/Photos", 50);
  EXPECT_EQ(removals->remove(drive + "/In/Photos"), 0);
  ASSERT_TRUE(waitFor([&] { return told(Stage::Waiting); }));
  std::filesystem::remove(drive + "/In");
  removals->cancel();
  ASSERT_TRUE(waitFor([&] { return told(Stage::PutBack); }));
  EXPECT_EQ(read(drive + "/In/Photos/sub/7"), "7");
}

// The program ends, or is killed, while folders are on their way out: they never come back by halves.
TEST_F(FilesRemovalsTest, WhatAProcessLeftIsRemovedByTheNext) {
  start();
  makeTree(drive + "/Photos", 50);
  EXPECT_EQ(removals->remove(drive + "/Photos"), 0);
  ASSERT_TRUE(waitFor([&] { return told(Stage::Waiting); }));
  removals.reset();
  EXPECT_FALSE(exists(drive + "/Photos"));
  EXPECT_GT(held(), 50u);
  start();
  EXPECT_TRUE(waitFor([&] { return held() == 0; }));
  EXPECT_TRUE(waitFor([&] { return log.count("drive: folders that were deleted before are removed now: 1") == 1; }));
}

TEST_F(FilesRemovalsTest, WhatALivingProcessHoldsIsLeftToIt) {
  makeTree(place + "/living/1", 3);
  makeTree(place + "/dead/1", 3);
  const UniqueFd lock(open((place + "/living").c_str(), O_RDONLY | O_DIRECTORY | O_CLOEXEC));
  ASSERT_EQ(flock(lock.get(), LOCK_EX), 0);
  start();
  EXPECT_TRUE(waitFor([&] { return !exists(place + "/dead"); }));
  EXPECT_EQ(read(place + "/living/1/sub/2"), "2");
}

TEST_F(FilesRemovalsTest, WhatIsOnItsWayOutIsNeitherIndexedNorCounted) {
  start();
  makeTree(drive + "/Photos", 50);
  write(drive + "/kept");
  EXPECT_EQ(removals->remove(drive + "/Photos"), 0);
  ASSERT_TRUE(waitFor([&] { return told(Stage::Waiting); }));
  std::vector<std::string> files;
  walkTree(mirror, [&files](const std::string& path, const struct stat& status) {
    if (S_ISREG(status.st_mode)) files.push_back(path);
    return true;
  });
  EXPECT_EQ(files, std::vector<std::string>{drive + "/kept"});
}

TEST_F(FilesRemovalsTest, ALinkAmongTheLeftoversLeadsNobodyAstray) {
  write(root + "/outside/kept");
  makeFolder(place + "/dead");
  link(root + "/outside", place + "/dead/1.link");
  start();
  EXPECT_TRUE(waitFor([&] { return !exists(place + "/dead"); }));
  EXPECT_TRUE(exists(root + "/outside/kept"));
}

TEST_F(FilesRemovalsTest, AFolderOnAnotherDiskIsHeldBesideItsPlace) {
  const std::string other = drive + "/Other";
  makeFolder(other);
  if (::mount("none", other.c_str(), "tmpfs", 0, "size=1m") != 0) GTEST_SKIP() << std::strerror(errno);
  start();
  makeTree(other + "/Photos", 50);
  EXPECT_EQ(removals->remove(other + "/Photos"), 0);
  EXPECT_FALSE(exists(other + "/Photos"));
  ASSERT_TRUE(waitFor([&] { return told(Stage::Waiting); }));
  removals.reset();
  EXPECT_FALSE(std::filesystem::is_empty(other)) << "the program ended before it was removed";
  start();
  EXPECT_TRUE(waitFor([&] { return std::filesystem::is_empty(other); }));
  EXPECT_TRUE(waitFor([&] { return held() == 0; }));
  ::umount2(other.c_str(), MNT_DETACH);
}

TEST_F(FilesRemovalsTest, AFolderThatMayNotBeTouchedStaysWhole) {
  start();
  makeTree(drive + "/Photos", 3);
  if (::mount(drive.c_str(), drive.c_str(), nullptr, MS_BIND, nullptr) != 0) GTEST_SKIP() << std::strerror(errno);
  ::mount(nullptr, drive.c_str(), nullptr, MS_BIND | MS_REMOUNT | MS_RDONLY, nullptr);
  LocalFileManager files(removals.get());
  const auto error = files.removeItemAtURL(URL(drive + "/Photos", true));
  ::umount2(drive.c_str(), MNT_DETACH);
  ASSERT_TRUE(error);
  EXPECT_EQ(error->code, FileErrorCode::WriteVolumeReadOnly);
  for (int i = 0; i < 3; ++i) EXPECT_EQ(read(drive + "/Photos/sub/" + std::to_string(i)), std::to_string(i));
}

TEST_F(FilesRemovalsTest, OurOwnFoldersWithoutPermissionGoTooAndNoLinkIsFollowed) {
  start();
  write(root + "/outside/kept");
  makeTree(drive + "/Photos", 3);
  link(root + "/outside", drive + "/Photos/sub/link");
  ASSERT_EQ(chmod((drive + "/Photos/sub").c_str(), 0), 0);
  EXPECT_EQ(removals->remove(drive + "/Photos"), 0);
  EXPECT_TRUE(waitFor([&] { return held() == 0; }));
  EXPECT_TRUE(exists(root + "/outside/kept"));
}

}  // namespace

}  // namespace vaelo
