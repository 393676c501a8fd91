// SPDX-License-Identifier: GPL-3.0-or-later
// What other programs do to an item that somebody shows: the test is the other program.
#include <condition_variable>
#include <mutex>

#include "host/drive/promise_file.h"
#include "host/files/glib_queues.h"
#include "host/files/local_file_coordination.h"
#include "tests/host/drive_test_support.h"

namespace vaelo {

namespace {

/// Writes down what it is told, and lets the test wait for it.
class WaitingPresenter : public FilePresenter {
 public:
  WaitingPresenter(std::string path, Queues& queues)
      : url_(path), queue_(queues.makeOperationQueue("presenter", QualityOfService::Default)) {}
  std::optional<URL> presentedItemURL() override {
    const std::lock_guard lock(mutex_);
    return url_;
  }
  std::shared_ptr<OperationQueue> presentedItemOperationQueue() override { return queue_; }
  void presentedItemDidChange() override { hear("changed"); }
  void presentedItemDidMoveToURL(const URL& url) override {
    {
      const std::lock_guard lock(mutex_);
      url_ = url;
    }
    hear("moved to " + url.path());
  }
  void accommodatePresentedItemDeletionWithCompletionHandler(Completion completion) override {
    hear("deletion");
    completion(std::nullopt);
  }
  void accommodatePresentedSubitemDeletionAtURLCompletionHandler(const URL& url, Completion completion) override {
    hear("deletion of " + url.path());
    completion(std::nullopt);
  }

  /// True when it is told so within a second of now.
  bool hears(const std::string& what) {
    std::unique_lock lock(mutex_);
    return heard_.wait_for(lock, std::chrono::seconds(1), [&] { return count(what) > 0; });
  }
  std::vector<std::string> told() {
    const std::lock_guard lock(mutex_);
    return told_;
  }
  void forget() {
    const std::lock_guard lock(mutex_);
    told_.clear();
  }

 private:
  void hear(const std::string& what) {
    const std::lock_guard lock(mutex_);
    told_.push_back(what);
    heard_.notify_all();
  }
  long count(const std::string& what) const { return std::count(told_.begin(), told_.end(), what); }

  std::mutex mutex_;  // guards all below but the queue
  std::condition_variable heard_;
  URL url_;
  std::vector<std::string> told_;
  std::shared_ptr<OperationQueue> queue_;  // last, so that it ends before what its blocks use
};

using Told = std::vector<std::string>;

class PresenterWatchingTest : public drive_test::DriveTest {
 protected:
  PresenterWatchingTest() { write(document, "before"); }
  ~PresenterWatchingTest() override { leave(); }
  void show(const std::string& path) {
    presenter = std::make_unique<WaitingPresenter>(path, queues);
    coordination.addFilePresenter(*presenter);
  }
  void leave() {
    if (presenter) coordination.removeFilePresenter(*presenter);
    presenter.reset();
  }
  /// Until what happened before has been looked at once, which is too early to say that something is gone.
  void untilLookedAt() {
    const std::string other = root + "/next.txt";
    write(other, "1");
    WaitingPresenter next(other, queues);
    coordination.addFilePresenter(next);
    write(other, "and 2");
    EXPECT_TRUE(next.hears("changed"));
    coordination.removeFilePresenter(next);
  }
  /// After a later change to another item has been told, what came before it has been too.
  Told toldInTheEnd() {
    const std::string other = root + "/later.txt";
    write(other, "1");
    WaitingPresenter later(other, queues);
    coordination.addFilePresenter(later);
    std::filesystem::remove(other);
    EXPECT_TRUE(later.hears("deletion"));
    coordination.removeFilePresenter(later);
    return presenter->told();
  }

  const std::string document = drive + "/Documents/Letter.txt";
  const std::string folder = drive + "/Documents";
  GLibQueues queues;
  LocalFileCoordination coordination{root + "/lock"};
  std::unique_ptr<WaitingPresenter> presenter;
};

TEST_F(PresenterWatchingTest, TagsAreAChangeAndOtherAttributesAreNot) {
  show(document);
  setAttribute(document, "user.vaelo.docid", "7");
  std::filesystem::permissions(document, std::filesystem::perms::owner_read);
  untilLookedAt();
  EXPECT_EQ(presenter->told(), Told());
  setAttribute(document, "user.xdg.tags", "Red");
  EXPECT_TRUE(presenter->hears("changed"));
  presenter->forget();
  removeAttribute(document, "user.xdg.tags");
  EXPECT_TRUE(presenter->hears("changed"));
}

TEST_F(PresenterWatchingTest, AChangeIsAChange) {
  show(document);
  write(document, "after, and longer");
  EXPECT_TRUE(presenter->hears("changed"));
}

TEST_F(PresenterWatchingTest, SavingUnderANewNameAndRenamingIsAChangeAndNoDeletion) {
  show(document);
  write(folder + "/.Letter.txt.new", "saved");
  rename(folder + "/.Letter.txt.new", document);
  EXPECT_TRUE(presenter->hears("changed"));
  EXPECT_EQ(toldInTheEnd(), Told{"changed"});
  presenter->forget();
  write(document, "and written again, which is seen though it is another file now");
  EXPECT_TRUE(presenter->hears("changed"));
}

TEST_F(PresenterWatchingTest, SavingWithABackupIsAChangeAndNoMove) {
  show(document);
  rename(document, document + "~");
  untilLookedAt();
  EXPECT_EQ(presenter->told(), Told{});
  write(document, "saved");
  EXPECT_TRUE(presenter->hears("changed"));
  EXPECT_EQ(toldInTheEnd(), Told{"changed"});
}

TEST_F(PresenterWatchingTest, DeletingIsADeletion) {
  show(document);
  std::filesystem::remove(document);
  EXPECT_TRUE(presenter->hears("deletion"));
  EXPECT_EQ(toldInTheEnd(), Told{"deletion"});
}

TEST_F(PresenterWatchingTest, RenamingAndMovingAreFollowed) {
  show(document);
  rename(document, folder + "/Renamed.txt");
  EXPECT_TRUE(presenter->hears("moved to " + folder + "/Renamed.txt"));
  rename(folder + "/Renamed.txt", drive + "/Elsewhere/Letter.txt");
  EXPECT_TRUE(presenter->hears("moved to " + drive + "/Elsewhere/Letter.txt"));
  presenter->forget();
  write(drive + "/Elsewhere/Letter.txt", "changed where it is now");
  EXPECT_TRUE(presenter->hears("changed"));
  EXPECT_EQ(toldInTheEnd(), Told{"changed"});
}

TEST_F(PresenterWatchingTest, AMoveOfAFolderFarAboveIsFollowed) {
  write(drive + "/A/B/C/Letter.txt");
  show(drive + "/A/B/C/Letter.txt");
  rename(drive + "/A", drive + "/Z");
  EXPECT_TRUE(presenter->hears("moved to " + drive + "/Z/B/C/Letter.txt"));
  std::filesystem::remove_all(drive + "/Z");
  EXPECT_TRUE(presenter->hears("deletion"));
}

TEST_F(PresenterWatchingTest, AFileWithADeletedOnesNameIsNotTakenForIt) {
  show(document);
  write(document + " (deleted)", "the kernel says so of deleted files");
  std::filesystem::remove(document);
  EXPECT_TRUE(presenter->hears("deletion"));
}

TEST_F(PresenterWatchingTest, AFolderInItsPlaceIsAChange) {
  show(document);
  std::filesystem::remove(document);
  makeFolder(document);
  EXPECT_TRUE(presenter->hears("changed"));
  EXPECT_EQ(toldInTheEnd(), Told{"changed"});
}

TEST_F(PresenterWatchingTest, OtherItemsOfItsFolderAreNoConcern) {
  show(document);
  write(folder + "/Other.txt", "1");
  rename(folder + "/Other.txt", folder + "/Third.txt");
  std::filesystem::remove(folder + "/Third.txt");
  EXPECT_EQ(toldInTheEnd(), Told{});
}

TEST_F(PresenterWatchingTest, APromiseAndItsDocumentAreOneItem) {
  PromiseInfo info;
  info.name = "Film.mp4";
  info.size = 4;
  ASSERT_FALSE(writePromise(folder, info));
  show(folder + "/Film.mp4");
  write(folder + "/.Film.mp4.vlopartial", "1");
  write(folder + "/.Film.mp4.vlopartial", "film");
  rename(folder + "/.Film.mp4.vlopartial", folder + "/Film.mp4");
  std::filesystem::remove(promisePathFor(folder + "/Film.mp4"));
  EXPECT_TRUE(presenter->hears("changed"));
  presenter->forget();
  ASSERT_FALSE(writePromise(folder, info));
  std::filesystem::remove(folder + "/Film.mp4");
  EXPECT_TRUE(presenter->hears("changed"));
  EXPECT_EQ(toldInTheEnd(), Told{"changed"});
  rename(promisePathFor(folder + "/Film.mp4"), promisePathFor(folder + "/Movie.mp4"));
  EXPECT_TRUE(presenter->hears("moved to " + folder + "/Movie.mp4"));
}

TEST_F(PresenterWatchingTest, WhatHappensInAPackageIsToldOfThePackage) {
  const std::string package = folder + "/Album.sketchbundle";
  write(package + "/pages/1.txt");
  write(package + "/pages/2.txt");
  show(package);
  write(package + "/pages/1.txt", "changed");
  EXPECT_TRUE(presenter->hears("changed"));
  presenter->forget();
  // A new folder is followed as well.
  write(package + "/new/deep/3.txt");
  EXPECT_TRUE(presenter->hears("changed"));
  EXPECT_EQ(toldInTheEnd().back(), "changed");
  presenter->forget();
  write(package + "/new/deep/3.txt", "changed");
  EXPECT_TRUE(presenter->hears("changed"));
  std::filesystem::remove(package + "/pages/2.txt");
  EXPECT_TRUE(presenter->hears("deletion of " + package + "/pages/2.txt"));
}

TEST_F(PresenterWatchingTest, SavingWithinAPackageDeletesNothing) {
  const std::string package = folder + "/Album.sketchbundle";
  write(package + "/1.txt");
  show(package);
  write(package + "/1.tmp", "saved");
  rename(package + "/1.tmp", package + "/1.txt");
  write(package + "/lock");
  std::filesystem::remove(package + "/lock");
  rename(package + "/1.txt", package + "/1.txt~");
  write(package + "/1.txt", "saved again");
  EXPECT_TRUE(presenter->hears("changed"));
  for (const std::string& line : toldInTheEnd()) EXPECT_EQ(line, "changed");
}

TEST_F(PresenterWatchingTest, WhatThisProgramDoesIsToldOnce) {
  show(document);
  const auto coordinator = coordination.makeCoordinator();
  const URL to(folder + "/Moved.txt");
  coordinator->coordinateWriting(URL(document), WritingForMoving, to, WritingForReplacing, [&](const URL& from, const URL&) {
    coordinator->itemWillMove(from, to);
    rename(document, to.path());
    coordinator->itemDidMove(from, to);
  });
  EXPECT_TRUE(presenter->hears("moved to " + to.path()));
  coordinator->coordinateWriting(to, WritingDefault, [&](const URL& url) { write(url.path(), "by this program"); });
  EXPECT_TRUE(presenter->hears("changed"));
  untilLookedAt();
  coordinator->coordinateWriting(to, WritingForDeleting, [&](const URL& url) { std::filesystem::remove(url.path()); });
  EXPECT_EQ(toldInTheEnd(), (Told{"moved to " + to.path(), "changed", "deletion"}));
}

TEST_F(PresenterWatchingTest, AWriterIsNotJudgedBeforeItIsDone) {
  show(document);
  const auto coordinator = coordination.makeCoordinator();
  const URL to(folder + "/Moved.txt");
  coordinator->coordinateWriting(URL(document), WritingForMoving, to, WritingForReplacing, [&](const URL& from, const URL&) {
    std::filesystem::remove(document);
    EXPECT_EQ(toldInTheEnd(), Told{}) << "though nothing was there for longer than an editor takes";
    write(to.path(), "copied, as between two disks");
    coordinator->itemDidMove(from, to);
  });
  EXPECT_EQ(toldInTheEnd(), Told{"moved to " + to.path()});
}

// The window goes behind another one, in which the user renames the document.
TEST_F(PresenterWatchingTest, WhoComesBackHearsWhatHappenedMeanwhile) {
  show(document);
  coordination.removeFilePresenter(*presenter);
  rename(document, folder + "/Renamed.txt");
  write(folder + "/Renamed.txt", "and changed");
  EXPECT_EQ(presenter->told(), Told{});
  coordination.addFilePresenter(*presenter);
  EXPECT_TRUE(presenter->hears("moved to " + folder + "/Renamed.txt"));

  coordination.removeFilePresenter(*presenter);
  std::filesystem::remove(folder + "/Renamed.txt");
  coordination.addFilePresenter(*presenter);
  EXPECT_TRUE(presenter->hears("deletion"));
}

TEST_F(PresenterWatchingTest, WhatWasDeletedIsNotKeptOnTheDisk) {
  show(document);
  leave();
  std::filesystem::remove(document);
  presenter = std::make_unique<WaitingPresenter>(document, queues);
  toldInTheEnd();
  int held = 0;
  for (const auto& entry : std::filesystem::directory_iterator("/proc/self/fd")) {
    std::error_code ignored;
    held += std::filesystem::read_symlink(entry, ignored).string().starts_with(document);
  }
  EXPECT_EQ(held, 0);
}

TEST_F(PresenterWatchingTest, WhatWasNeverThereIsNotDeleted) {
  show(folder + "/Nothing.txt");
  EXPECT_EQ(toldInTheEnd(), Told{});
  write(folder + "/Nothing.txt");
  EXPECT_TRUE(presenter->hears("changed"));
}

TEST_F(PresenterWatchingTest, PresentersComeAndGoDuringAStorm) {
  std::atomic<bool> running = true;
  std::thread storm([&] {
    for (int i = 0; running; ++i) {
      write(document, std::to_string(i));
      if (i % 3 == 0) std::filesystem::remove(document);
      if (i % 7 == 0) write(folder + "/.tmp", "x"), rename(folder + "/.tmp", document);
    }
  });
  for (int round = 0; round < 200; ++round) {
    show(document);
    leave();
  }
  running = false;
  storm.join();
}

}  // namespace

}  // namespace vaelo
