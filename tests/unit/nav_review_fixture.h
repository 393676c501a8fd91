// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <algorithm>
#include <memory>
#include <string>
#include <utility>
#include <vector>

#include "app/app_delegate.h"
#include "tests/unit/animation_recorder.h"
#include "tests/unit/app_fixture.h"

namespace vaelo {

/// The corners of navigation, with bookmarks decoded on the spot.
class NavReviewTest : public AppFixture {
 protected:
  NavReviewTest() { memory.provider.answersAtOnce = true; }
  ~NavReviewTest() override {
    if (nav) nav->setHost(nullptr);
    delegate = nullptr;
    window = nullptr;
    nav = nullptr;
  }

  void loadShownNav() {
    loadNav();
    window->setPresentationHost(&shown);
    window->setRootViewController(nav);
    nav->setHost(&shown);
  }
  bool launch(const LaunchOptions& options = {}) {
    delegate = std::make_shared<AppDelegate>();
    const bool result = delegate->applicationWillFinishLaunchingWithOptions(options);
    nav = std::dynamic_pointer_cast<NavController>(delegate->rootWindow()->rootViewController());
    return result;
  }
  bool continueActivity(const std::string& type, Dictionary userInfo = {}) {
    return delegate->applicationContinueUserActivityRestorationHandler(makeActivity(type, std::move(userInfo)), [] {});
  }
  void recentDocument(Dictionary userInfo) {
    delegate->applicationPerformActionForShortcutItemCompletionHandler({RecentDocumentShortcutType, std::move(userInfo)},
                                                                       [](bool) { ADD_FAILURE() << "never called"; });
  }
  std::optional<URL> previewed() {
    return nav->itemManager() && nav->itemManager()->item() ? nav->itemManager()->item()->url() : std::nullopt;
  }
  std::shared_ptr<PreviewItemManager> previewing(const URL& url) {
    nav->warpToNewURLPreviewMode(url, 0);
    return nav->itemManager();
  }
  /// Of the first line with that text; the number of lines when there is none.
  std::size_t lineOf(const std::string& text) {
    const std::vector<std::string> lines = log().lines();
    return static_cast<std::size_t>(
        std::find_if(lines.begin(), lines.end(),
                     [&](const std::string& line) { return line.find(text) != std::string::npos; }) -
        lines.begin());
  }
  std::size_t countOf(const std::string& text) {
    const std::vector<std::string> lines = log().lines();
    return static_cast<std::size_t>(std::count_if(
        lines.begin(), lines.end(), [&](const std::string& line) { return line.find(text) != std::string::npos; }));
  }

  MemoryCloudDocuments& cloud = memory.cloud;
  MemoryFileCoordination& files = memory.coordination;
  AnimationRecorder shown;
  WindowRef window = std::make_shared<Window>();
  std::shared_ptr<AppDelegate> delegate;
  URL document = addFile("Plans/a.txt");
  URL other = addFile("Plans/b.txt");
};

}  // namespace vaelo
