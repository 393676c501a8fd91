// SPDX-License-Identifier: GPL-3.0-or-later
// A manager whose callbacks come on a thread of their own. What it shares is judged by a thread sanitizer.
#include <atomic>
#include <thread>

#include "tests/support/thread_operation_queue.h"
#include "tests/unit/preview_fixture.h"

namespace vaelo {
namespace {

using std::chrono::seconds;

class PreviewManagerThreadsTest : public PreviewFixture {
 protected:
  PreviewManagerThreadsTest() {
    memory.queues.makesOperationQueue = [](const std::string& name, QualityOfService quality) {
      return std::make_shared<ThreadOperationQueue>(name, quality);
    };
  }
};

TEST_F(PreviewManagerThreadsTest, CallbacksOfTheirOwnThreadAgreeWithTheMainThread) {
  const URL other = addFile("Plans/Other.pdf");
  const URL trash("/drive/mirror/.Trash/Report.pdf");
  const auto manager = show();
  const auto items = {DRItem::initWithURL(document), DRItem::initWithURL(other)};
  std::atomic<int> answers = 0;
  constexpr int rounds = 300;
  for (int i = 0; i < rounds; ++i) {
    manager->fcQueue()->addOperation([&, i] {
      manager->presentedItemURL();
      manager->presentedItemDidChange();
      if (i % 10 == 3) manager->presentedItemDidMoveToURL(i % 20 == 3 ? other : document);
      if (i % 50 == 7) manager->presentedItemDidMoveToURL(trash);
      if (i % 10 == 5) {
        manager->accommodatePresentedSubitemDeletionAtURLCompletionHandler(document,
                                                                           [&](std::optional<Error>) { ++answers; });
      }
      if (i % 25 == 9) {
        manager->accommodatePresentedItemDeletionWithCompletionHandler([&](std::optional<Error>) { ++answers; });
      }
    });
    manager->previewItem(*(items.begin() + i % 2));
    if (i % 3 == 0) resignActive();
    if (i % 3 == 1) becomeActive();
    advance(seconds(i % 5 == 0 ? 1 : 0));
  }
  std::static_pointer_cast<ThreadOperationQueue>(manager->fcQueue())->waitUntilAllFinished();
  advance(seconds(2));
  EXPECT_EQ(answers, rounds / 10 + rounds / 25);
  EXPECT_FALSE(manager->refreshPending());
  manager->unregisterAsFilePresenter();
  EXPECT_FALSE(manager->filePresenterRegistered());
  EXPECT_EQ(manager->batonActivity(), nullptr);
  EXPECT_TRUE(memory.coordination.presenters().empty());
}

TEST_F(PreviewManagerThreadsTest, NoticesFromManyThreadsMakeOneRefresh) {
  const auto manager = show();
  std::vector<std::thread> threads;
  for (int i = 0; i < 4; ++i) {
    threads.emplace_back([&manager] {
      for (int j = 0; j < 50; ++j) manager->presentedItemDidChange();
    });
  }
  for (std::thread& thread : threads) thread.join();
  advance(seconds(1));
  EXPECT_EQ(times("INFO", "Refreshing " + text(document)), 1u);
}

TEST_F(PreviewManagerThreadsTest, NoticesComeWhileTheManagerRegistersAndLeaves) {
  const auto manager = show();
  for (int i = 0; i < 50; ++i) {
    std::thread other([this] {
      for (int j = 0; j < 20; ++j) memory.coordination.othersChanged(document);
    });
    for (int j = 0; j < 20; ++j) {
      manager->unregisterAsFilePresenter();
      manager->registerAsFilePresenter();
    }
    other.join();
  }
  std::static_pointer_cast<ThreadOperationQueue>(manager->fcQueue())->waitUntilAllFinished();
  advance(seconds(1));
  EXPECT_FALSE(manager->refreshPending());
}

// The thread of the notices must not come to be the last to hold the manager: its end waits for that thread.
TEST_F(PreviewManagerThreadsTest, AManagerThatIsDroppedDuringADeletionEndsOnTheMainThread) {
  for (int i = 0; i < 200; ++i) {
    auto manager = show();
    const std::weak_ptr<PreviewItemManager> weak = manager;
    memory.coordination.othersDelete(document);
    manager = nullptr;
    while (!weak.expired()) advance({});
  }
  EXPECT_TRUE(memory.coordination.presenters().empty());
}

TEST_F(PreviewManagerThreadsTest, RegistrationFromManyThreadsIsOne) {
  const auto manager = show();
  std::vector<std::thread> threads;
  for (int i = 0; i < 4; ++i) {
    threads.emplace_back([&manager] {
      for (int j = 0; j < 50; ++j) {
        manager->unregisterAsFilePresenter();
        manager->registerAsFilePresenter();
      }
    });
  }
  for (std::thread& thread : threads) thread.join();
  EXPECT_TRUE(manager->filePresenterRegistered());
  EXPECT_THAT(memory.coordination.presenters(), ::testing::ElementsAre(manager.get()));
}

}  // namespace
}  // namespace vaelo
