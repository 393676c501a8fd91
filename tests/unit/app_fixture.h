// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <gtest/gtest.h>

#include <chrono>
#include <memory>
#include <optional>
#include <string>
#include <vector>

#include "app/document_list_controller_status_bar.h"
#include "app/nav_controller.h"
#include "items/dr_item.h"
#include "platform/ui/alert_controller.h"
#include "preview/glimpse_item_controller.h"
#include "preview/preview_item_manager.h"
#include "tests/support/memory_platform.h"

namespace vaelo {

/// A drive in memory with somebody signed in, on a virtual clock; nav is made by loadNav.
class AppFixture : public ::testing::Test {
 protected:
  AppFixture();
  ~AppFixture() override;

  // The drive. Paths are below the drive's own folder; folders above are made as needed.
  URL addFolder(const std::string& path);
  URL addFile(const std::string& path);
  URL addLink(const std::string& path, const URL& target);
  /// The logical URL of an item that is not downloaded.
  URL addPromise(const std::string& path);
  URL addTrashedFile(const std::string& name);
  URL addOutsideFile(const std::string& path);
  void giveDocumentID(const URL& url, std::int64_t number);
  void makePreviewable(const URL& url);
  void makeUnpreviewable(const URL& url);
  void giveOwningApplication(const URL& document);
  std::string bookmarkableString(const URL& url);

  // The account.
  void signIn(const std::string& account);
  void signOut();
  std::optional<UbiquityIdentityToken> token();
  std::optional<UbiquityIdentityToken> savedToken();
  void identityChanged();
  void becomeActive();
  void resignActive();
  void setOffer(int level);
  void fetchOfferOnRequest();
  void offerChanged();
  ViewControllerRef upgradeFlowPresenter();
  void setFreeBytes(std::int64_t bytes);
  void failQuota(const Error& error);
  int quotaFetches();

  // Screens.
  void loadNav();
  std::shared_ptr<DocumentListController> makeList(const URL& folder);
  std::shared_ptr<DocumentListController> topList();
  void makeNoRootList();
  void makeNoUnavailableScreen();
  void makeNoHierarchies();
  void makeTablet();
  /// The screen over which a document was handed to an application last.
  ViewControllerRef openingPresenter();
  void presentSomething();
  std::shared_ptr<AlertController> presentedAlert();
  std::string statusText();

  // Time, and what was recorded.
  /// Runs what is due on every queue.
  void runMainQueue() { advance({}); }
  void runAllQueues() { advance({}); }
  void advance(std::chrono::nanoseconds time);
  RecordingLog& log();
  bool logged(const std::string& level, const std::string& message) { return log().has(level, message); }
  bool loggedStarting(const std::string& level, const std::string& start);
  const std::vector<std::string>& userActions();
  int exitStatusOfLoop();
  std::shared_ptr<UserActivity> makeActivity(const std::string& type, Dictionary userInfo);
  Platform& platform() { return Platform::current(); }
  Preferences& preferences() { return platform().preferences; }

  // Before nav, which uses it until it is gone.
  MemoryPlatform memory;
  std::shared_ptr<NavController> nav;
};

}  // namespace vaelo
