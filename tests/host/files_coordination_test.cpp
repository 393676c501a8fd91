// SPDX-License-Identifier: GPL-3.0-or-later
#include <fcntl.h>
#include <sys/file.h>

#include <atomic>
#include <future>
#include <latch>
#include <thread>

#include "host/files/glib_queues.h"
#include "host/files/local_file_coordination.h"
#include "host/support/unique_fd.h"
#include "tests/host/drive_test_support.h"

namespace vaelo {

namespace {

/// Writes down what it is told, and answers a deletion when the test says so.
class RecordingPresenter : public FilePresenter {
 public:
  explicit RecordingPresenter(std::string path, std::shared_ptr<OperationQueue> queue = nullptr)
      : url_(path), queue_(queue ? queue : std::make_shared<drive_test::InlineOperations>()) {}
  std::optional<URL> presentedItemURL() override { return url_; }
  std::shared_ptr<OperationQueue> presentedItemOperationQueue() override { return queue_; }
  void presentedItemDidChange() override {
    if (onChange) onChange();
    told.push_back("changed");
  }
  void presentedItemDidMoveToURL(const URL& url) override { told.push_back("moved to " + url.path()); }
  void accommodatePresentedItemDeletionWithCompletionHandler(Completion completion) override {
    told.push_back("deletion");
    answered = true;
    if (answers) completion(std::nullopt);
  }
  void accommodatePresentedSubitemDeletionAtURLCompletionHandler(const URL& url, Completion completion) override {
    told.push_back("deletion of " + url.path());
    completion(std::nullopt);
  }

  std::vector<std::string> told;
  std::function<void()> onChange;
  std::atomic<bool> answered = false;
  bool answers = true;

 private:
  URL url_;
  std::shared_ptr<OperationQueue> queue_;
};

using Told = std::vector<std::string>;

class FilesCoordinationTest : public drive_test::DriveTest {
 protected:
  void writeTo(const std::string& path, unsigned options = WritingDefault, FilePresenter* presenter = nullptr) {
    int runs = 0;
    EXPECT_FALSE(coordination.makeCoordinator(presenter)->coordinateWriting(URL(path), options, [&](const URL& url) {
      EXPECT_EQ(url.path(), path);
      ++runs;
    }));
    EXPECT_EQ(runs, 1);
  }
  /// Whether another program could lock the drive now.
  bool otherProgramCan(int mode) const {
    const UniqueFd file(open(lockFile.c_str(), O_RDWR | O_CREAT, 0600));
    return flock(file.get(), mode | LOCK_NB) == 0;
  }

  const std::string lockFile = root + "/lock";
  LocalFileCoordination coordination{lockFile};
};

TEST_F(FilesCoordinationTest, OneThreadNeverWaitsForItself) {
  int depth = 0;
  const auto outer = coordination.makeCoordinator();
  outer->coordinateReading(URL("/a"), ReadingDefault, [&](const URL&) {
    coordination.makeCoordinator()->coordinateWriting(URL("/a"), WritingDefault, [&](const URL&) {
      outer->coordinateWriting(URL("/a/b"), WritingForMoving, URL("/a"), WritingForReplacing, [&](const URL&, const URL&) {
        coordination.makeCoordinator()->coordinateReading(URL("/a"), ReadingDefault, [&](const URL&) { depth = 4; });
      });
    });
  });
  EXPECT_EQ(depth, 4);
}

TEST_F(FilesCoordinationTest, AWriterIsAloneWithItsItem) {
  std::atomic<int> readers = 0;
  std::atomic<int> writers = 0;
  std::atomic<int> faults = 0;
  std::vector<std::thread> threads;
  for (int thread = 0; thread < 4; ++thread) {
    threads.emplace_back([&, thread] {
      const auto coordinator = coordination.makeCoordinator();
      for (int round = 0; round < 300; ++round) {
        // The folder, an item in it, and an item in that exclude each other.
        const URL url(round % 3 == 0 ? "/a" : round % 3 == 1 ? "/a/b" : "/a/b/c");
        if ((round + thread) % 2) {
          coordinator->coordinateReading(url, ReadingImmediatelyAvailableMetadataOnly, [&](const URL&) {
            ++readers;
            if (writers) ++faults;
            std::this_thread::yield();
            --readers;
          });
        } else {
          coordinator->coordinateWriting(url, WritingDefault, [&](const URL&) {
            if (url.path() == "/a" && (++writers != 1 || readers)) ++faults;
            std::this_thread::yield();
            if (url.path() == "/a") --writers;
          });
        }
      }
    });
  }
  for (std::thread& thread : threads) thread.join();
  EXPECT_EQ(faults, 0);
}

TEST_F(FilesCoordinationTest, ReadersMeetAndOthersPass) {
  std::latch both(2);
  const auto meet = [&](const URL&) { both.arrive_and_wait(); };
  std::thread other([&] { coordination.makeCoordinator()->coordinateReading(URL("/a"), ReadingDefault, meet); });
  coordination.makeCoordinator()->coordinateReading(URL("/a"), ReadingDefault, meet);
  other.join();
  // "/ab" only looks as if it were in "/a".
  coordination.makeCoordinator()->coordinateWriting(URL("/a"), WritingDefault, [&](const URL&) {
    std::thread([&] {
      coordination.makeCoordinator()->coordinateReading(URL("/ab"), ReadingImmediatelyAvailableMetadataOnly,
                                                        [](const URL&) {});
    }).join();
  });
}

TEST_F(FilesCoordinationTest, ThreadsThatWouldWaitForEachOtherAreToldSo) {
  std::latch both(2);
  std::atomic<int> refused = 0;
  std::atomic<int> ran = 0;
  const auto work = [&] {
    coordination.makeCoordinator()->coordinateReading(URL("/a"), ReadingImmediatelyAvailableMetadataOnly, [&](const URL&) {
      both.arrive_and_wait();
      const auto error = coordination.makeCoordinator()->coordinateWriting(URL("/a"), 0, [&](const URL&) { ++ran; });
      if (error) {
        EXPECT_EQ(error->code, FileErrorCode::WriteUnknown);
        ++refused;
      }
    });
  };
  std::thread other(work);
  work();
  other.join();
  EXPECT_EQ(refused, 1);
  EXPECT_EQ(ran, 1);
}

TEST_F(FilesCoordinationTest, OtherProgramsWaitForWritersAndReadersOfContent) {
  const auto coordinator = coordination.makeCoordinator();
  coordinator->coordinateWriting(URL("/a"), WritingDefault, [&](const URL&) { EXPECT_FALSE(otherProgramCan(LOCK_SH)); });
  coordinator->coordinateReading(URL("/a"), ReadingDefault, [&](const URL&) {
    EXPECT_TRUE(otherProgramCan(LOCK_SH));
    EXPECT_FALSE(otherProgramCan(LOCK_EX));
  });
  coordinator->coordinateReading(URL("/a"), ReadingImmediatelyAvailableMetadataOnly,
                                 [&](const URL&) { EXPECT_TRUE(otherProgramCan(LOCK_EX)); });
  EXPECT_TRUE(otherProgramCan(LOCK_EX));
}

TEST_F(FilesCoordinationTest, WithoutALockFileAccessesStillRun) {
  LocalFileCoordination unlocked("/nowhere/at/all");
  bool ran = false;
  EXPECT_FALSE(unlocked.makeCoordinator()->coordinateWriting(URL("/a"), 0, [&](const URL&) { ran = true; }));
  EXPECT_TRUE(ran);
}

TEST_F(FilesCoordinationTest, PresentersAreToldOfChangesToTheirItemAndInIt) {
  RecordingPresenter folder("/a"), item("/a/b"), sibling("/a/bc");
  for (FilePresenter* presenter : {&folder, &item, &sibling}) coordination.addFilePresenter(*presenter);
  writeTo("/a/b");
  EXPECT_EQ(item.told, Told{"changed"});
  EXPECT_EQ(folder.told, Told{"changed"});
  EXPECT_TRUE(sibling.told.empty());
  writeTo("/a/b", WritingDefault, &item);
  EXPECT_EQ(item.told.size(), 1u);
  EXPECT_EQ(folder.told.size(), 2u);
  coordination.removeFilePresenter(folder);
  coordination.removeFilePresenter(folder);
  writeTo("/a/b", WritingForMoving);
  writeTo("/a");
  EXPECT_EQ(folder.told.size(), 2u);
  EXPECT_EQ(item.told.size(), 1u);
}

TEST_F(FilesCoordinationTest, PresentersFollowMoves) {
  RecordingPresenter folder("/a"), item("/a/b/c"), other("/ab");
  for (FilePresenter* presenter : {&folder, &item, &other}) coordination.addFilePresenter(*presenter);
  const auto coordinator = coordination.makeCoordinator();
  coordinator->coordinateWriting(URL("/a"), WritingForMoving, URL("/x/y"), WritingForReplacing,
                                 [&](const URL& from, const URL& to) {
                                   coordinator->itemWillMove(from, to);
                                   coordinator->itemDidMove(from, to);
                                 });
  EXPECT_EQ(folder.told, Told{"moved to /x/y"});
  EXPECT_EQ(item.told, Told{"moved to /x/y/b/c"});
  EXPECT_TRUE(other.told.empty());
}

TEST_F(FilesCoordinationTest, DeletionWaitsForTheAnswersOfAllThatAreConcerned) {
  GLibQueues queues;
  const auto queue = queues.makeOperationQueue("presenter", QualityOfService::Default);
  RecordingPresenter item("/a/b", queue);
  RecordingPresenter inside("/a/b/c");
  RecordingPresenter folder("/a");
  for (FilePresenter* presenter : {&item, &inside, &folder}) coordination.addFilePresenter(*presenter);
  coordination.makeCoordinator()->coordinateWriting(URL("/a/b"), WritingForDeleting,
                                                    [&](const URL&) { EXPECT_TRUE(item.answered); });
  EXPECT_EQ(item.told, Told{"deletion"});
  EXPECT_EQ(inside.told, Told{"deletion"});
  EXPECT_EQ(folder.told, Told{"deletion of /a/b"});
  coordination.removeFilePresenter(item);
}

TEST_F(FilesCoordinationTest, APresenterThatNeverAnswersDoesNotKeepAnybodyFromDeleting) {
  RecordingPresenter item("/a");
  item.answers = false;
  coordination.addFilePresenter(item);
  writeTo("/a", WritingForDeleting);
  EXPECT_EQ(item.told, Told{"deletion"});
}

TEST_F(FilesCoordinationTest, APresenterMayLeaveAndCoordinateInItsOwnCallback) {
  RecordingPresenter item("/a");
  coordination.addFilePresenter(item);
  item.onChange = [&] {
    coordination.removeFilePresenter(item);
    coordination.makeCoordinator()->coordinateReading(URL("/a"), ReadingDefault, [](const URL&) {});
  };
  writeTo("/a");
  writeTo("/a");
  EXPECT_EQ(item.told, Told{"changed"});
}

// A preview leaves while it holds the lock that its callback is waiting for: neither may wait for the other.
TEST_F(FilesCoordinationTest, LeavingDoesNotWaitForACallbackThatRuns) {
  GLibQueues queues;
  auto queue = queues.makeOperationQueue("presenter", QualityOfService::Default);
  RecordingPresenter item("/a", queue);
  std::mutex lock;
  std::promise<void> entered;
  item.onChange = [&] {
    entered.set_value();
    const std::lock_guard held(lock);
  };
  coordination.addFilePresenter(item);
  {
    const std::lock_guard held(lock);
    writeTo("/a");
    entered.get_future().wait();
    coordination.removeFilePresenter(item);
  }
  writeTo("/a");
  std::promise<void> drained;
  queue->addOperation([&] { drained.set_value(); });
  drained.get_future().wait();
}

}  // namespace

}  // namespace vaelo
