// SPDX-License-Identifier: GPL-3.0-or-later
#include "tests/unit/app_fixture.h"

#include <algorithm>

#include "platform/archive.h"

namespace vaelo {

AppFixture::AppFixture() {
  memory.formatting.translations = {{".DICT.ITEMS.%d", "items: %@"},
                                    {".DICT.ITEMS_SELECTED.%d", "selected: %@"},
                                    {".DICT.AVAILABLE.%g", "%2$@ (%1$@) available"}};
}

AppFixture::~AppFixture() {
  nav = nullptr;
  // The shared preview screen lives for the whole process; the next test finds it as at the start.
  const auto& glimpse = GlimpseItemController::defaultController();
  glimpse->removeFromParent();
}

URL AppFixture::addFolder(const std::string& path) {
  const URL url = Drive.appendingPathComponent(path, true);
  memory.disk.addFolder(url.path());
  return url;
}
URL AppFixture::addFile(const std::string& path) {
  const URL url = Drive.appendingPathComponent(path);
  memory.disk.add(url.path());
  return url;
}
URL AppFixture::addLink(const std::string& path, const URL& target) {
  const URL url = Drive.appendingPathComponent(path);
  memory.disk.addLink(url.path(), target.path());
  return url;
}
URL AppFixture::addPromise(const std::string& path) {
  const URL url = Drive.appendingPathComponent(path);
  memory.disk.addPromise(url.path());
  return url;
}
URL AppFixture::addTrashedFile(const std::string& name) {
  const URL url = Mirror.appendingPathComponent(".Trash").appendingPathComponent(name);
  memory.disk.add(url.path());
  return url;
}
URL AppFixture::addOutsideFile(const std::string& path) {
  memory.disk.add(path);
  return URL(path);
}
void AppFixture::giveDocumentID(const URL& url, std::int64_t number) {
  memory.disk.items.at(url.path()).documentID = number;
}
void AppFixture::makePreviewable(const URL& url) { memory.screens.unpreviewable.erase(url.path()); }
void AppFixture::makeUnpreviewable(const URL& url) { memory.screens.unpreviewable.insert(url.path()); }
void AppFixture::giveOwningApplication(const URL& document) {
  ApplicationRecord application;
  application.bundleIdentifier = "org.example.Writer";
  application.isInstalled = application.supportsOpenInPlace = true;
  memory.launch.rankedByPath.insert_or_assign(document.path(), DocumentRecord::Ranked{{HandlerRankOwner, {application}}});
}
std::string AppFixture::bookmarkableString(const URL& url) { return memory.provider.encoded(url).value.value_or(""); }

void AppFixture::signIn(const std::string& account) { memory.cloud.account = UbiquityIdentityToken{account}; }
void AppFixture::signOut() { memory.cloud.account.reset(); }
std::optional<UbiquityIdentityToken> AppFixture::token() { return memory.cloud.account; }
std::optional<UbiquityIdentityToken> AppFixture::savedToken() {
  const auto data = memory.preferences.dataForKey("com.marrow.VaeloDriveApp.UbiquityIdentityToken");
  return data ? unarchiveToken(*data) : std::nullopt;
}
void AppFixture::identityChanged() { memory.notifications.post({IdentityDidChangeNotification, {}}); }
void AppFixture::becomeActive() { memory.notifications.post({DidBecomeActiveNotification, {}}); }
void AppFixture::resignActive() { memory.notifications.post({WillResignActiveNotification, {}}); }
void AppFixture::setOffer(int level) { memory.offers.offer = std::make_shared<MemoryOffer>(level); }
void AppFixture::fetchOfferOnRequest() { memory.offers.isBeingFetched = true; }
void AppFixture::offerChanged() { memory.notifications.post({OfferChangedNotification, {}}); }
ViewControllerRef AppFixture::upgradeFlowPresenter() { return memory.screens.upgradeFlowPresenter; }
void AppFixture::setFreeBytes(std::int64_t bytes) { memory.cloud.quota = Result<std::int64_t>(bytes); }
void AppFixture::failQuota(const Error& error) { memory.cloud.quota = Result<std::int64_t>(error); }
int AppFixture::quotaFetches() { return memory.cloud.quotaFetches; }

void AppFixture::loadNav() {
  nav = std::make_shared<NavController>();
  nav->view();
}
std::shared_ptr<DocumentListController> AppFixture::makeList(const URL& folder) { return memory.screens.makeList(folder); }
std::shared_ptr<DocumentListController> AppFixture::topList() { return nav->getTopDocumentListController(); }
void AppFixture::makeNoRootList() { memory.screens.hasNoRootList = true; }
void AppFixture::makeNoUnavailableScreen() { memory.screens.hasNoUnavailableScreen = true; }
void AppFixture::makeNoHierarchies() { memory.screens.hasNoHierarchies = true; }
void AppFixture::makeTablet() { memory.screens.deviceShown.idiom = InterfaceIdiom::Slate; }
ViewControllerRef AppFixture::openingPresenter() { return memory.screens.openingPresenter; }
void AppFixture::presentSomething() { nav->presentViewController(std::make_shared<ViewController>(), false); }
std::shared_ptr<AlertController> AppFixture::presentedAlert() {
  return std::dynamic_pointer_cast<AlertController>(nav->presentedViewController());
}
std::string AppFixture::statusText() { return statusBarOf(*topList())->labelsView()->primaryLabel()->text(); }

void AppFixture::advance(std::chrono::nanoseconds time) { memory.clock->advance(time); }
RecordingLog& AppFixture::log() { return memory.log; }
bool AppFixture::loggedStarting(const std::string& level, const std::string& start) {
  const std::vector<std::string> lines = log().lines();
  return std::any_of(lines.begin(), lines.end(), [&](const std::string& line) {
    return line.starts_with("(VLO)[" + level + "] ") && line.find(") " + start) != std::string::npos;
  });
}
const std::vector<std::string>& AppFixture::userActions() { return memory.tracing.userActions; }
int AppFixture::exitStatusOfLoop() { return MemoryApplication::ExitStatus; }
std::shared_ptr<UserActivity> AppFixture::makeActivity(const std::string& type, Dictionary userInfo) {
  auto activity = std::make_shared<MemoryUserActivity>(type);
  activity->setUserInfo(std::move(userInfo));
  return activity;
}

}  // namespace vaelo
