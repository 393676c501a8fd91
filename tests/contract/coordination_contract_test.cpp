// SPDX-License-Identifier: GPL-3.0-or-later
#include <chrono>

#include "tests/contract/contract_test.h"

namespace vaelo::contract {
namespace {

using Names = std::vector<std::string>;

/// Keeps what it was told, on a queue of the platform.
class RecordingPresenter : public FilePresenter {
 public:
  RecordingPresenter(Queues& queues, std::optional<URL> url)
      : url_(std::move(url)), queue_(queues.makeOperationQueue("presenter", QualityOfService::Default)) {}

  std::vector<std::string> told() const {
    const std::lock_guard lock(mutex_);
    return told_;
  }

  std::optional<URL> presentedItemURL() override {
    const std::lock_guard lock(mutex_);
    return url_;
  }
  std::shared_ptr<OperationQueue> presentedItemOperationQueue() override { return queue_; }
  void presentedItemDidChange() override { note("changed"); }
  void presentedItemDidMoveToURL(const URL& url) override {
    note("moved " + url.path());
    const std::lock_guard lock(mutex_);
    url_ = url;
  }
  void accommodatePresentedItemDeletionWithCompletionHandler(Completion completion) override {
    note("deleted");
    completion(std::nullopt);
  }
  void accommodatePresentedSubitemDeletionAtURLCompletionHandler(const URL& url, Completion completion) override {
    note("deleted below " + url.path());
    completion(std::nullopt);
  }

 private:
  void note(std::string what) {
    const std::lock_guard lock(mutex_);
    told_.push_back(std::move(what));
  }
  mutable std::mutex mutex_;  // guards the two below
  std::optional<URL> url_;
  std::vector<std::string> told_;
  const std::shared_ptr<OperationQueue> queue_;  // last: what is under way in it uses the others
};

class CoordinationContract : public ContractTest {
 protected:
  CoordinationContract() { platform->addFile(item.path()); }
  ~CoordinationContract() override {
    for (const auto& presenter : presenters_) platform->coordination().removeFilePresenter(*presenter);
  }
  RecordingPresenter& present(std::optional<URL> url) {
    presenters_.push_back(std::make_unique<RecordingPresenter>(platform->queues(), std::move(url)));
    platform->coordination().addFilePresenter(*presenters_.back());
    return *presenters_.back();
  }
  std::unique_ptr<FileCoordinator> coordinator(FilePresenter* presenter = nullptr) {
    return platform->coordination().makeCoordinator(presenter);
  }
  std::optional<Error> write(const URL& url, unsigned options, FilePresenter* presenter = nullptr) {
    return coordinator(presenter)->coordinateWriting(url, options, [](const URL&) {});
  }
  /// True when the presenter is told that, and nothing else, by the time that `last` has been told of its own item.
  void expectTold(RecordingPresenter& presenter, const Names& expected) {
    if (!expected.empty()) platform->until([&] { return presenter.told().size() >= expected.size(); });
    // Whatever else is under way has come by the time that a later notice has.
    const std::size_t before = fence_.told().size();
    write(fenceURL_, WritingDefault);
    platform->until([&] { return fence_.told().size() > before; });
    EXPECT_EQ(presenter.told(), expected);
  }

  const URL folder = inDrive("folder", true);
  const URL item = inDrive("folder/item");

 private:
  std::vector<std::unique_ptr<RecordingPresenter>> presenters_;
  const URL fenceURL_ = outside("fence");
  RecordingPresenter& fence_ = present(fenceURL_);
};

VAELO_CONTRACT_SUITE(CoordinationContract);

TEST_P(CoordinationContract, AnAccessorRunsOnceWithTheURLBeforeTheCallReturns) {
  Names seen;
  const auto note = [&](const URL& url) { seen.push_back(url.path()); };
  EXPECT_FALSE(coordinator()->coordinateReading(item, ReadingDefault, note));
  EXPECT_FALSE(coordinator()->coordinateReading(item, ReadingImmediatelyAvailableMetadataOnly, note));
  EXPECT_FALSE(coordinator()->coordinateWriting(item, WritingDefault, note));
  EXPECT_EQ(seen, Names(3, item.path()));
}

TEST_P(CoordinationContract, AWriteOfTwoItemsGetsBothInTheirOrder) {
  Names seen;
  EXPECT_FALSE(coordinator()->coordinateWriting(item, WritingForMoving, inDrive("to"), WritingForReplacing,
                                                [&](const URL& from, const URL& to) {
                                                  seen = {from.path(), to.path()};
                                                }));
  EXPECT_EQ(seen, (Names{item.path(), inDrive("to").path()}));
}

TEST_P(CoordinationContract, WhatIsNotThereIsCoordinatedToo) {
  bool ran = false;
  EXPECT_FALSE(coordinator()->coordinateWriting(inDrive("gone/below"), WritingDefault, [&](const URL&) { ran = true; }));
  EXPECT_TRUE(ran);
}

TEST_P(CoordinationContract, AccessesOfOneThreadNestWithoutEnd) {
  Names order;
  const auto outer = coordinator();
  const auto inner = coordinator();
  EXPECT_FALSE(outer->coordinateWriting(folder, WritingDefault, [&](const URL&) {
    order.push_back("write");
    EXPECT_FALSE(inner->coordinateReading(item, ReadingDefault, [&](const URL&) {
      order.push_back("read in it");
      EXPECT_FALSE(outer->coordinateWriting(item, WritingDefault, [&](const URL&) { order.push_back("write in that"); }));
    }));
  }));
  EXPECT_EQ(order, (Names{"write", "read in it", "write in that"}));
}

TEST_P(CoordinationContract, TheNextAccessFindsTheWayFree) {
  for (int i = 0; i < 3; ++i) EXPECT_FALSE(write(item, WritingDefault));
  bool ran = false;
  EXPECT_FALSE(coordinator()->coordinateReading(folder, ReadingDefault, [&](const URL&) { ran = true; }));
  EXPECT_TRUE(ran);
}

TEST_P(CoordinationContract, AWriteTellsThoseWhoShowTheItemOrAFolderAboveIt) {
  RecordingPresenter& ofItem = present(item);
  RecordingPresenter& ofFolder = present(folder);
  RecordingPresenter& ofOther = present(inDrive("folder/item2"));
  RecordingPresenter& ofBelow = present(inDrive("folder/item/below"));
  write(item, WritingDefault);
  expectTold(ofItem, {"changed"});
  expectTold(ofFolder, {"changed"});
  expectTold(ofOther, {});
  expectTold(ofBelow, {});
}

TEST_P(CoordinationContract, AReadTellsNobody) {
  RecordingPresenter& presenter = present(item);
  EXPECT_FALSE(coordinator()->coordinateReading(item, ReadingDefault, [](const URL&) {}));
  expectTold(presenter, {});
}

TEST_P(CoordinationContract, ThePresenterThatWritesIsNotToldOfIt) {
  RecordingPresenter& writer = present(item);
  RecordingPresenter& other = present(item);
  write(item, WritingDefault, &writer);
  write(item, WritingForDeleting, &writer);
  expectTold(other, {"changed", "deleted"});
  expectTold(writer, {});
}

TEST_P(CoordinationContract, ADeletionIsToldBeforeItHappens) {
  RecordingPresenter& presenter = present(item);
  Names toldByThen;
  EXPECT_FALSE(
      coordinator()->coordinateWriting(item, WritingForDeleting, [&](const URL&) { toldByThen = presenter.told(); }));
  EXPECT_EQ(toldByThen, Names{"deleted"});
  expectTold(presenter, {"deleted"});
}

TEST_P(CoordinationContract, ADeletionIsToldAboveAndBelow) {
  RecordingPresenter& above = present(folder);
  RecordingPresenter& below = present(inDrive("folder/item/below"));
  RecordingPresenter& beside = present(inDrive("folder/item2"));
  write(item, WritingForDeleting);
  expectTold(above, {"deleted below " + item.path()});
  expectTold(below, {"deleted"});
  expectTold(beside, {});
}

TEST_P(CoordinationContract, AMoveTakesThoseWhoShowTheItemAlong) {
  const URL to = inDrive("elsewhere/new");
  RecordingPresenter& ofItem = present(item);
  RecordingPresenter& below = present(inDrive("folder/item/a/b", true));
  RecordingPresenter& beside = present(inDrive("folder/item2"));
  RecordingPresenter& above = present(folder);
  const auto mover = coordinator();
  EXPECT_FALSE(
      mover->coordinateWriting(item, WritingForMoving, to, WritingForReplacing, [&](const URL& from, const URL& there) {
        mover->itemWillMove(from, there);
        mover->itemDidMove(from, there);
      }));
  expectTold(ofItem, {"moved " + to.path()});
  expectTold(below, {"moved " + to.path() + "/a/b"});
  expectTold(beside, {});
  expectTold(above, {});
}

TEST_P(CoordinationContract, AMoveThatIsOnlyAnnouncedIsNotToldOf) {
  RecordingPresenter& presenter = present(item);
  const auto mover = coordinator();
  EXPECT_FALSE(mover->coordinateWriting(item, WritingForMoving, inDrive("to"), WritingForReplacing,
                                        [&](const URL& from, const URL& to) { mover->itemWillMove(from, to); }));
  expectTold(presenter, {});
}

TEST_P(CoordinationContract, WhoShowsNothingOrHasLeftIsToldNothing) {
  RecordingPresenter& ofNothing = present(std::nullopt);
  RecordingPresenter& gone = present(item);
  platform->coordination().removeFilePresenter(gone);
  write(item, WritingDefault);
  write(item, WritingForDeleting);
  expectTold(ofNothing, {});
  expectTold(gone, {});
}

TEST_P(CoordinationContract, LeavingTwiceOrWithoutHavingComeIsHarmless) {
  RecordingPresenter stranger(platform->queues(), item);
  platform->coordination().removeFilePresenter(stranger);
  RecordingPresenter& presenter = present(item);
  platform->coordination().removeFilePresenter(presenter);
  platform->coordination().removeFilePresenter(presenter);
  EXPECT_FALSE(write(item, WritingForDeleting));
}

// Other programs, which coordinate nothing.

TEST_P(CoordinationContract, AnotherProgramsChangeIsTold) {
  RecordingPresenter& presenter = present(item);
  RecordingPresenter& beside = present(inDrive("folder/item2"));
  platform->changeBehind(item.path(), "longer than before");
  EXPECT_TRUE(platform->until([&] { return !presenter.told().empty(); }));
  EXPECT_EQ(presenter.told().front(), "changed");
  expectTold(beside, {});
}

TEST_P(CoordinationContract, AnotherProgramsRenameIsFollowed) {
  RecordingPresenter& presenter = present(item);
  platform->renameBehind(item.path(), inDrive("folder/renamed").path());
  const std::string moved = "moved " + inDrive("folder/renamed").path();
  EXPECT_TRUE(platform->until([&] { return presenter.told() == Names{moved}; }));
  platform->renameBehind(folder.path(), inDrive("elsewhere").path());
  EXPECT_TRUE(platform->until([&] {
    return presenter.told() == Names{moved, "moved " + inDrive("elsewhere/renamed").path()};
  })) << "with the folder above";
}

TEST_P(CoordinationContract, AnotherProgramsDeletionIsTold) {
  RecordingPresenter& presenter = present(item);
  platform->removeBehind(item.path());
  EXPECT_TRUE(platform->until([&] { return !presenter.told().empty(); }));
  EXPECT_EQ(presenter.told(), Names{"deleted"});
}

TEST_P(CoordinationContract, TheDeletionOfAFolderIsThatOfWhatIsInIt) {
  RecordingPresenter& presenter = present(item);
  platform->removeBehind(folder.path());
  EXPECT_TRUE(platform->until([&] { return !presenter.told().empty(); }));
  EXPECT_EQ(presenter.told(), Names{"deleted"});
}

TEST_P(CoordinationContract, SavingByRenamingIsAChange) {
  RecordingPresenter& presenter = present(item);
  platform->changeBehind(inDrive("folder/.item.new").path(), "saved anew");
  platform->renameBehind(inDrive("folder/.item.new").path(), item.path());
  EXPECT_TRUE(platform->until([&] { return !presenter.told().empty(); }));
  EXPECT_EQ(presenter.told().front(), "changed");
}

TEST_P(CoordinationContract, WhatHappensInAPackageIsToldOfThePackage) {
  const URL package = inDrive("album.sketchbundle", true);
  platform->addFile(package.path() + "/pages/1");
  RecordingPresenter& presenter = present(package);
  platform->changeBehind(package.path() + "/pages/1", "longer than before");
  EXPECT_TRUE(platform->until([&] { return !presenter.told().empty(); }));
  EXPECT_EQ(presenter.told().front(), "changed");
  platform->removeBehind(package.path() + "/pages/1");
  EXPECT_TRUE(platform->until([&] { return presenter.told().back() == "deleted below " + package.path() + "/pages/1"; }));
}

TEST_P(CoordinationContract, ADocumentThatIsDownloadedHasChanged) {
  const URL far = inDrive("far");
  platform->addPromise(far.path(), PromiseFacts{4, {}, {}, false, {}, {}});
  RecordingPresenter& presenter = present(far);
  platform->transfer(far.path(), 4, 4);
  EXPECT_TRUE(platform->until([&] { return !presenter.told().empty(); }));
  EXPECT_EQ(presenter.told().front(), "changed");
}

}  // namespace
}  // namespace vaelo::contract
