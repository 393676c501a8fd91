// SPDX-License-Identifier: GPL-3.0-or-later
// Moves that take long, from the main loop.
#include <gmock/gmock.h>

#include <thread>

#include "host/files/local_file_manager.h"
#include "host/files/long_work.h"
#include "host/files/move_history.h"
#include "items/file_utils.h"
#include "tests/host/platform_fixture.h"

namespace vaelo {

namespace {

using ::testing::ElementsAre;
using ::testing::IsEmpty;

/// Runs on the main loop, as whatever a person starts.
void onMainLoop(const std::function<void()>& deed) {
  bool done = false;
  std::function<void()> both = [&] {
    deed();
    done = true;
  };
  g_idle_add_once([](gpointer held) { (*static_cast<std::function<void()>*>(held))(); }, &both);
  while (!done) g_main_context_iteration(nullptr, TRUE);
}

class LongWorkTest : public testing::Test {
 protected:
  LongWorkTest() {
    work.setWatcher([this](LongWork::Kind kind, const std::string* path) {
      told.push_back(!path ? "watch nothing" : (kind == LongWork::Kind::Removal ? "watch removal " : "watch ") + *path);
    });
  }
  void waitForTheEnd() {
    while (told.empty() || told.back() != "ended") g_main_context_iteration(nullptr, TRUE);
  }

  std::vector<std::string> told;
  LongWork work{[this](bool isUnderWay) { told.push_back(isUnderWay ? "began" : "ended"); }, std::chrono::milliseconds(1)};
};

TEST_F(LongWorkTest, RunsOnTheSpotOutsideOfTheMainLoop) {
  const std::thread::id here = std::this_thread::get_id();
  const int answer = work.run("/a", [&](const auto& goOn) {
    EXPECT_EQ(std::this_thread::get_id(), here);
    return goOn() ? 7 : 0;
  });
  EXPECT_EQ(answer, 7);
  EXPECT_THAT(told, IsEmpty());
}

TEST_F(LongWorkTest, TheMainLoopGoesOnInsideOfTheCall) {
  onMainLoop([this] {
    std::atomic<bool> heard = false;
    const std::thread::id here = std::this_thread::get_id();
    g_timeout_add_once(
        5, [](gpointer flag) { *static_cast<std::atomic<bool>*>(flag) = true; }, &heard);
    const int answer = work.run("/a", [&](const auto&) {
      EXPECT_NE(std::this_thread::get_id(), here);
      while (!heard) std::this_thread::yield();
      return 7;
    });
    EXPECT_EQ(answer, 7);
  });
  EXPECT_THAT(told, ElementsAre("began", "watch /a"));
  waitForTheEnd();
  EXPECT_THAT(told, ElementsAre("began", "watch /a", "watch nothing", "ended"));
}

TEST_F(LongWorkTest, ARowOfCallsIsOnePieceOfWork) {
  const auto takesLong = [](const auto&) {
    const auto start = std::chrono::steady_clock::now();
    while (std::chrono::steady_clock::now() - start < std::chrono::milliseconds(3)) std::this_thread::yield();
    return 0;
  };
  onMainLoop([&] {
    work.run("/a", takesLong);
    work.run("/b", takesLong);
  });
  waitForTheEnd();
  EXPECT_THAT(told, ElementsAre("began", "watch /a", "watch /b", "watch nothing", "ended"));
}

TEST_F(LongWorkTest, WhatIsCancelledEndsWithAllThatFollowsInTheRow) {
  onMainLoop([this] {
    g_timeout_add_once(
        5, [](gpointer held) { static_cast<LongWork*>(held)->cancel(); }, &work);
    const auto untilTold = [](const auto& goOn) {
      while (goOn()) std::this_thread::yield();
      return ECANCELED;
    };
    EXPECT_EQ(work.run("/a", untilTold), ECANCELED);
    EXPECT_EQ(work.run("/b", untilTold), ECANCELED);
  });
  waitForTheEnd();
  EXPECT_FALSE(work.isCancelled());
  onMainLoop([this] { EXPECT_EQ(work.run("/c", [](const auto& goOn) { return goOn() ? 0 : ECANCELED; }), 0); });
}

TEST_F(LongWorkTest, WhatIsOverInAMomentIsNotToldOf) {
  LongWork patient([this](bool) { told.push_back("told"); }, std::chrono::hours(1));
  onMainLoop([&] { EXPECT_EQ(patient.run("/a", [](const auto&) { return 3; }), 3); });
  EXPECT_THAT(told, IsEmpty());
}

void spin(std::chrono::microseconds time) {
  const auto start = std::chrono::steady_clock::now();
  while (std::chrono::steady_clock::now() - start < time) std::this_thread::yield();
}

TEST_F(LongWorkTest, TheMainLoopGoesOnBetweenTheStepsOfALongRow) {
  unsigned heard = 0;
  const guint timer = g_timeout_add(
      1,
      [](gpointer counter) -> gboolean {
        ++*static_cast<unsigned*>(counter);
        return G_SOURCE_CONTINUE;
      },
      &heard);
  onMainLoop([&] {
    const unsigned before = heard;
    for (int i = 0; i < 100; ++i) {
      EXPECT_TRUE(work.step("/" + std::to_string(i), LongWork::Kind::Move));
      spin(std::chrono::microseconds(100));
    }
    EXPECT_GE(heard, before + 3);
  });
  g_source_remove(timer);
  ASSERT_GE(told.size(), 4u);
  EXPECT_EQ(told.at(0), "began");
  EXPECT_THAT(told.at(1), testing::StartsWith("watch /"));
  EXPECT_THAT(told, testing::Not(testing::Contains("ended"))) << "the row is one piece of work";
  waitForTheEnd();
  EXPECT_EQ(std::count(told.begin(), told.end(), "began"), 1);
}

TEST_F(LongWorkTest, AShortRowIsNotToldOf) {
  LongWork patient([this](bool) { told.push_back("told"); }, std::chrono::hours(1));
  onMainLoop([&] {
    for (int i = 0; i < 100; ++i) EXPECT_TRUE(patient.step("/a", LongWork::Kind::Move));
  });
  EXPECT_THAT(told, IsEmpty());
}

TEST_F(LongWorkTest, StepsThatAreFarApartAreNoRow) {
  LongWork patient([this](bool) { told.push_back("told"); }, std::chrono::milliseconds(20));
  const auto singly = [&] { EXPECT_TRUE(patient.step("/a", LongWork::Kind::Move)); };
  onMainLoop(singly);
  bool later = false;
  g_timeout_add_once(
      60, [](gpointer flag) { *static_cast<bool*>(flag) = true; }, &later);
  while (!later) g_main_context_iteration(nullptr, TRUE);
  onMainLoop(singly);
  EXPECT_THAT(told, IsEmpty());
}

TEST_F(LongWorkTest, OutsideOfTheMainLoopAStepIsNothing) {
  for (int i = 0; i < 3; ++i) {
    EXPECT_TRUE(work.step("/a", LongWork::Kind::Move));
    spin(std::chrono::milliseconds(1));
  }
  EXPECT_THAT(told, IsEmpty());
}

TEST_F(LongWorkTest, ACancelledRowTakesNoMoreSteps) {
  onMainLoop([this] {
    g_timeout_add_once(
        2, [](gpointer held) { static_cast<LongWork*>(held)->cancel(); }, &work);
    while (work.step("/a", LongWork::Kind::Move)) spin(std::chrono::microseconds(100));
    EXPECT_FALSE(work.step("/b", LongWork::Kind::Move));
  });
  waitForTheEnd();
  onMainLoop([this] { EXPECT_TRUE(work.step("/c", LongWork::Kind::Move)); });
}

/// Between the drive and another file system.
class LongMovesTest : public drive_test::PlatformTest {
 protected:
  LongMovesTest() {
    std::string pattern = "/dev/shm/vaelo-long-XXXXXX";
    if (const char* made = ::mkdtemp(pattern.data())) other = made;
  }
  ~LongMovesTest() override { std::filesystem::remove_all(other); }
  bool hasOtherFileSystem() const {
    struct stat a {};
    struct stat b {};
    return !other.empty() && stat(other.c_str(), &a) == 0 && stat(root.c_str(), &b) == 0 && a.st_dev != b.st_dev;
  }
  std::string other;
};

TEST_F(LongMovesTest, WhatMovesAroundItIsOfferedTogether) {
  std::vector<std::shared_ptr<const MoveHistory::Batch>> offers;
  platform.moves().setOffer([&](const auto& batch) { offers.push_back(batch); });
  for (const char* name : {"/a", "/b"}) write(drive + name);
  const auto move = [this](const std::string& name) {
    EXPECT_FALSE(FileUtils::moveTo(URL(drive + name), URL(drive + "/moved " + name.substr(1))));
  };
  onMainLoop([&] {
    move("/a");
    // What the first one posted comes before it.
    bool ran = false;
    platform.queues().main().after(std::chrono::milliseconds(1), [&] { ran = true; });
    platform.longWork().run("/far away", [](const auto&) {
      const auto start = std::chrono::steady_clock::now();
      while (std::chrono::steady_clock::now() - start < std::chrono::milliseconds(100)) std::this_thread::yield();
      return 0;
    });
    EXPECT_TRUE(ran);
    EXPECT_THAT(offers, IsEmpty());
    move("/b");
  });
  while (offers.empty()) g_main_context_iteration(nullptr, TRUE);
  EXPECT_EQ(offers.size(), 1u);
  EXPECT_EQ(offers.at(0)->size(), 2u);
}

TEST_F(LongMovesTest, AMoveBetweenDisksIsLongWork) {
  if (!hasOtherFileSystem()) GTEST_SKIP() << "one file system only";
  write(other + "/tree/a", std::string(16 << 20, 'a'));
  std::vector<std::string> watched;
  LongWork work([](bool) {}, std::chrono::milliseconds(1));
  work.setWatcher([&](LongWork::Kind, const std::string* path) { watched.push_back(path ? *path : ""); });
  LocalFileManager files(nullptr, {}, &work);
  onMainLoop([&] { EXPECT_FALSE(files.moveItemAtURL(URL(other + "/tree"), URL(drive + "/tree"))); });
  EXPECT_THAT(watched, testing::Contains(other + "/tree"));
  EXPECT_EQ(read(drive + "/tree/a").size(), 16u << 20);
  EXPECT_FALSE(exists(other + "/tree"));
}

TEST_F(LongMovesTest, WhatIsCancelledInARowOfRenamesStaysWhereItIs) {
  write(drive + "/a", "a");
  LongWork work([](bool) {});
  LocalFileManager files(nullptr, {}, &work);
  const auto before = content(drive);
  onMainLoop([&] {
    work.cancel();
    const auto error = files.moveItemAtURL(URL(drive + "/a"), URL(drive + "/b"));
    ASSERT_TRUE(error);
    EXPECT_EQ(error->code, FileErrorCode::UserCancelled);
  });
  EXPECT_EQ(content(drive), before);
}

TEST_F(LongMovesTest, RemovalsAreARowToo) {
  for (const char* name : {"/a", "/b"}) write(drive + name);
  std::vector<std::string> watched;
  LongWork work([](bool) {}, std::chrono::milliseconds(0));
  work.setWatcher([&](LongWork::Kind kind, const std::string* path) {
    if (path && kind == LongWork::Kind::Removal) watched.push_back(*path);
  });
  LocalFileManager files(nullptr, {}, &work);
  onMainLoop([&] {
    EXPECT_FALSE(files.removeItemAtURL(URL(drive + "/a")));
    work.cancel();
    const auto error = files.removeItemAtURL(URL(drive + "/b"));
    ASSERT_TRUE(error);
    EXPECT_EQ(error->code, FileErrorCode::UserCancelled);
  });
  EXPECT_THAT(watched, testing::Contains(drive + "/a"));
  EXPECT_FALSE(exists(drive + "/a"));
  EXPECT_TRUE(exists(drive + "/b"));
}

TEST_F(LongMovesTest, ACancelledMoveLeavesTheSourceWholeAndNothingElse) {
  if (!hasOtherFileSystem()) GTEST_SKIP() << "one file system only";
  write(other + "/tree/a", "a");
  write(other + "/tree/b", std::string(300000, 'b'));
  LongWork work([](bool) {}, std::chrono::milliseconds(0));
  LocalFileManager files(nullptr, {}, &work);
  const auto before = content(other);
  const auto beforeHere = content(drive);
  onMainLoop([&] {
    work.cancel();
    const auto error = files.moveItemAtURL(URL(other + "/tree"), URL(drive + "/tree"));
    ASSERT_TRUE(error);
    EXPECT_EQ(error->code, FileErrorCode::UserCancelled);
    EXPECT_EQ(error->localizedDescription, "“tree” stays where it is.");
  });
  EXPECT_EQ(content(other), before);
  EXPECT_EQ(content(drive), beforeHere);
}

}  // namespace

}  // namespace vaelo
