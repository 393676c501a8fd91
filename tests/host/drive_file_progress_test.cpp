// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/drive/drive_file_progress.h"

#include "host/drive/promise_file.h"
#include "tests/host/drive_test_support.h"
#include "tests/host/list_test_folder.h"

namespace vaelo {

namespace {

using list_test::waitUntil;

class DriveFileProgressTest : public drive_test::DriveTest {
 protected:
  void promise(const std::string& name, std::uint64_t size) {
    makeFolder(drive);
    PromiseInfo info;
    info.name = name;
    info.size = size;
    ASSERT_FALSE(writePromise(drive, info));
  }
  std::string partial(const std::string& name) const { return DriveFileProgress::partialPathFor(drive + "/" + name); }
  void subscribe(const std::string& path) {
    token = progresses.subscribe(URL(path), [this](std::shared_ptr<Progress> progress) {
      ++published;
      hear(*progress);
      observation = progress->observe("fractionCompleted", [this, progress](const std::string&) { hear(*progress); });
      return [this] {
        ++withdrawn;
        observation.reset();
      };
    });
  }
  void hear(const Progress& progress) {
    EXPECT_EQ(progress.kind(), FileProgressKind);
    heardAt.push_back(g_get_monotonic_time());
    completed = progress.completedUnits();
    total = progress.totalUnits();
  }

  DriveFileProgress progresses;
  std::shared_ptr<void> token;
  std::shared_ptr<void> observation;
  int published = 0;
  int withdrawn = 0;
  std::int64_t completed = -1;
  std::int64_t total = -1;
  std::vector<gint64> heardAt;
};

TEST_F(DriveFileProgressTest, APartialFileGrowsIntoTheDocument) {
  promise("Film.mp4", 1000);
  subscribe(drive + "/Film.mp4");
  write(partial("Film.mp4"), std::string(250, 'x'));
  ASSERT_TRUE(waitUntil([&] { return completed == 250; }));
  EXPECT_EQ(total, 1000);
  write(partial("Film.mp4"), std::string(900, 'x'));
  ASSERT_TRUE(waitUntil([&] { return completed == 900; }));
  EXPECT_EQ(withdrawn, 0);
  rename(partial("Film.mp4"), drive + "/Film.mp4");
  ASSERT_TRUE(waitUntil([&] { return withdrawn == 1; }));
  EXPECT_EQ(completed, 1000);
  EXPECT_EQ(published, 1);
}

TEST_F(DriveFileProgressTest, APartialFileThatIsThereAlreadyIsPublished) {
  promise("Film.mp4", 1000);
  write(partial("Film.mp4"), std::string(10, 'x'));
  subscribe(drive + "/.Film.mp4.vlopromise");
  EXPECT_EQ(published, 0) << "before the subscriber had its token";
  ASSERT_TRUE(waitUntil([&] { return completed == 10; }));
}

TEST_F(DriveFileProgressTest, ADocumentThatIsThereAtOneStrokeIsToldAsComplete) {
  promise("Note.txt", 7);
  subscribe(drive + "/Note.txt");
  write(root + "/downloaded", "content");
  rename(root + "/downloaded", drive + "/Note.txt");
  ASSERT_TRUE(waitUntil([&] { return withdrawn == 1; }));
  EXPECT_EQ(completed, total);
  EXPECT_GT(total, 0);
}

TEST_F(DriveFileProgressTest, ADownloadThatIsGivenUpIsWithdrawnAndMayBeginAgain) {
  promise("Film.mp4", 1000);
  subscribe(drive + "/Film.mp4");
  write(partial("Film.mp4"), "1");
  ASSERT_TRUE(waitUntil([&] { return published == 1; }));
  std::filesystem::remove(partial("Film.mp4"));
  ASSERT_TRUE(waitUntil([&] { return withdrawn == 1; }));
  EXPECT_EQ(completed, 1) << "an end that is no success must not look like one";
  write(partial("Film.mp4"), "22");
  ASSERT_TRUE(waitUntil([&] { return completed == 2; }));
  EXPECT_EQ(published, 2);
}

TEST_F(DriveFileProgressTest, NoMoreThanTwentyReportsASecond) {
  promise("Film.mp4", 3000);
  subscribe(drive + "/Film.mp4");
  std::ofstream file(partial("Film.mp4"));
  for (int i = 0; i < 3000; ++i) {
    file << 'x' << std::flush;
    while (g_main_context_iteration(nullptr, FALSE)) {
    }
  }
  ASSERT_TRUE(waitUntil([&] { return completed == 3000; }));
  for (std::size_t i = 1; i < heardAt.size(); ++i) EXPECT_GE(heardAt[i] - heardAt[i - 1], 48000) << i;
}

TEST_F(DriveFileProgressTest, OddSizesStayInBounds) {
  promise("Small.txt", 3);
  subscribe(drive + "/Small.txt");
  write(partial("Small.txt"), "longer than promised");
  ASSERT_TRUE(waitUntil([&] { return published == 1; }));
  EXPECT_EQ(completed, 3);
  EXPECT_EQ(total, 3);

  promise("Unknown", 0);
  subscribe(drive + "/Unknown");
  write(partial("Unknown"), "12");
  ASSERT_TRUE(waitUntil([&] { return published == 2; }));
  EXPECT_EQ(completed, 2);
  EXPECT_EQ(total, 0);
}

TEST_F(DriveFileProgressTest, WhatIsNoFileIsNoDownload) {
  promise("Film.mp4", 1000);
  subscribe(drive + "/Film.mp4");
  makeFolder(partial("Film.mp4"));
  write(drive + "/Other.txt");
  bool looked = false;
  const guint timer = g_timeout_add(
      200, [](gpointer flag) -> gboolean { return !(*static_cast<bool*>(flag) = true); }, &looked);
  ASSERT_TRUE(waitUntil([&] { return looked; })) << timer;
  EXPECT_EQ(published, 0);
}

TEST_F(DriveFileProgressTest, ASubscriberMayLeaveWhileItIsTold) {
  promise("Film.mp4", 10);
  token = progresses.subscribe(URL(drive + "/Film.mp4"), [this](const std::shared_ptr<Progress>&) {
    ++published;
    return [this] {
      ++withdrawn;
      token.reset();
    };
  });
  write(partial("Film.mp4"), "1");
  ASSERT_TRUE(waitUntil([&] { return published == 1; }));
  std::filesystem::remove(partial("Film.mp4"));
  ASSERT_TRUE(waitUntil([&] { return withdrawn == 1; }));
  EXPECT_EQ(token, nullptr);
}

TEST_F(DriveFileProgressTest, LongNamesHaveAPartialFileToo) {
  const std::string name(250, 'n');
  promise(name, 4);
  EXPECT_LE(partial(name).size() - drive.size() - 1, 255u);
  subscribe(drive + "/" + name);
  write(partial(name), "12");
  ASSERT_TRUE(waitUntil([&] { return completed == 2; }));
}

}  // namespace

}  // namespace vaelo
