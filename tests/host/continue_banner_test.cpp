// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/gtk/continue_banner.h"

#include <gtest/gtest.h>

#include <map>

#include "host/drive/published_activity.h"
#include "tests/host/drive_test_support.h"

namespace vaelo {

namespace {

/// Knows the documents that the test has put into the drive, and answers when the test says so.
class ChosenProvider : public FileProvider {
 public:
  void BookmarkableStringFromDocumentURL(const URL&, std::function<void(Result<std::string>)>) override {}
  void DocumentURLFromBookmarkableString(const std::string& text, std::function<void(Result<URL>)> done) override {
    asked.push_back([this, text, done = std::move(done)] {
      const auto found = documents.find(text);
      done(found == documents.end() ? Result<URL>(Error{}) : Result<URL>(URL(found->second)));
    });
  }
  void answer() {
    for (const auto& each : std::exchange(asked, {})) each();
  }
  std::map<std::string, std::string> documents = {{"a", "/drive/A.txt"}, {"b", "/drive/B.txt"}};
  std::vector<std::function<void()>> asked;
};

class ContinueOfferTest : public testing::Test {
 protected:
  void offer(const std::string& device, const std::string& document) {
    const auto activity = std::make_shared<PublishedActivity>("org.example.viewing", std::weak_ptr<CurrentActivity>());
    activity->setUserInfo({{UserActivityDocumentURLKey, document}});
    offered->setActivity(OfferedActivity{device, device, activity});
  }
  void settle() {
    provider.answer();
    queues.main().drain();
  }
  std::string text() const { return offered->text().value_or(""); }

  drive_test::TestQueues queues;
  ChosenProvider provider;
  std::vector<std::string> continued;
  std::shared_ptr<ContinueOffer> offered = std::make_shared<ContinueOffer>(
      provider, queues, [](const URL& url) { return url.lastPathComponent(); },
      [this](const std::shared_ptr<UserActivity>& activity) {
        continued.push_back(*activity->userInfo().at(UserActivityDocumentURLKey).get<std::string>());
      });
};

TEST_F(ContinueOfferTest, NamesTheDeviceAndTheDocumentOfThisDrive) {
  int changes = 0;
  const auto token = offered->observe([&] { ++changes; });
  offer("Slate", "a");
  settle();
  EXPECT_EQ(text(), "Continue from Slate: A.txt");
  offered->setActivity(std::nullopt);
  EXPECT_EQ(text(), "");
  EXPECT_EQ(changes, 2);
}

TEST_F(ContinueOfferTest, ContinuesOnce) {
  offer("Slate", "a");
  settle();
  offered->carryOn();
  offered->carryOn();
  EXPECT_EQ(continued, std::vector<std::string>{"a"});
  offer("Slate", "a");
  settle();
  EXPECT_EQ(text(), "");
}

TEST_F(ContinueOfferTest, WhatIsDismissedStaysAwayUntilAnotherDocument) {
  offer("Slate", "a");
  settle();
  offered->dismiss();
  EXPECT_EQ(text(), "");
  offered->setActivity(std::nullopt);
  offer("Slate", "a");
  settle();
  EXPECT_EQ(text(), "");
  offer("Slate", "b");
  settle();
  EXPECT_EQ(text(), "Continue from Slate: B.txt");
  offer("Phone", "a");
  settle();
  EXPECT_EQ(text(), "Continue from Phone: A.txt");
}

TEST_F(ContinueOfferTest, ADocumentThatTheDriveCarriesLaterIsOfferedThen) {
  offer("Slate", "c");
  settle();
  EXPECT_EQ(text(), "");
  provider.documents["c"] = "/drive/C.txt";
  offered->lookAgain();
  settle();
  EXPECT_EQ(text(), "Continue from Slate: C.txt");
  offered->lookAgain();
  EXPECT_TRUE(provider.asked.empty());
}

TEST_F(ContinueOfferTest, WhatIsTouchedIsWhatWasRead) {
  offer("Slate", "a");
  settle();
  offer("Slate", "b");
  EXPECT_EQ(text(), "Continue from Slate: A.txt");
  offered->carryOn();
  EXPECT_EQ(continued, std::vector<std::string>{"a"});
  settle();
  EXPECT_EQ(text(), "Continue from Slate: B.txt");
}

TEST_F(ContinueOfferTest, AnAnswerThatComesTooLateIsNotShown) {
  offer("Slate", "a");
  offered->setActivity(std::nullopt);
  settle();
  EXPECT_EQ(text(), "");
  offer("Slate", "a");
  offered.reset();
  settle();
}

TEST_F(ContinueOfferTest, AnActivityWithoutADocumentIsNoOffer) {
  offer("Slate", "");
  EXPECT_TRUE(provider.asked.empty());
}

}  // namespace

}  // namespace vaelo
