// SPDX-License-Identifier: GPL-3.0-or-later
#include "app/app_delegate.h"

#include "app/nav_controller.h"
#include "app/settings.h"
#include "items/url_additions.h"
#include "items/vlo_log.h"
#include "platform/archive.h"
#include "platform/platform.h"
#include "platform/ui/screen_factory.h"
#include "platform/url_components.h"

namespace vaelo {

namespace {

Value valueFor(const Dictionary& dictionary, const char* key) {
  const auto found = dictionary.find(key);
  return found == dictionary.end() ? Value() : found->second;
}

std::optional<std::string> stringFor(const Dictionary& dictionary, const char* key) {
  const Value value = valueFor(dictionary, key);
  const std::string* text = value.get<std::string>();
  return text ? std::optional(*text) : std::nullopt;
}

std::optional<URL> archivedURLFor(const Dictionary& dictionary, const char* key) {
  const Value value = valueFor(dictionary, key);
  const Data* data = value.get<Data>();
  return data ? unarchiveURL(*data) : std::nullopt;
}

/// The last "mode" with a known value wins; what can't be decoded is no known name or value.
long previewModeOf(const URLComponents& link) {
  long mode = 0;
  for (const URLComponents::QueryItem& item : link.queryItems) {
    if (percentDecoded(item.name) != "mode") continue;
    const std::optional<std::string> value = item.value ? percentDecoded(*item.value) : std::nullopt;
    if (value == "preview") mode = 0;
    if (value == "details" || value == "info") mode = 1;
  }
  return mode;
}

}  // namespace

bool AppDelegate::applicationWillFinishLaunchingWithOptions(const LaunchOptions& options) {
  ScreenFactory& screens = Platform::current().screens;
  rootWindow_ = screens.makeWindow(screens.device().mainScreen().bounds);
  rootWindow_->setBackgroundColor(Color::white());
  const auto navigation = std::make_shared<NavController>();
  if (screens.device().userInterfaceIdiom() != InterfaceIdiom::Slate || Settings::quickLaunch()) {
    rootWindow_->setRootViewController(navigation);
  }
  if (const ViewControllerRef& root = rootWindow_->rootViewController()) root->setRestorationIdentifier("Root");
  rootWindow_->makeKeyAndVisible();
  if (!options.shortcutItem) return true;
  VLO_INFO("Launched with shortcut: %{public}@", options.shortcutItem->type);
  applicationPerformActionForShortcutItemCompletionHandler(*options.shortcutItem, [](bool) {});
  return false;
}

bool AppDelegate::applicationDidFinishLaunchingWithOptions(const LaunchOptions&) { return true; }

bool AppDelegate::applicationOpenURLOptions(const std::string& url, const Dictionary& options) {
  VLO_USER_ACTION("AppDelegate: openURL");
  VLO_INFO("openURL: %@, options %{public}@, app %{public}@", url, Value(options),
           Platform::current().application.description());
  const std::optional<URLComponents> link = URLComponents::parse(url);
  if (!link || link->scheme != URLScheme) {
    VLO_WARNING("openURL: refused, not a link of this application");
    return false;
  }
  const std::optional<std::string> path = percentDecoded(link->path);
  if (!path || !path->starts_with('/')) {
    VLO_WARNING("openURL: refused, no absolute path");
    return false;
  }
  const std::optional<URL> target = vlo_URLByResolvingBookmark(URL(*path));
  const long mode = previewModeOf(*link);
  const auto navigation = rootNavController();
  return navigation && navigation->warpToNewURLPreviewMode(target, mode);
}

void AppDelegate::applicationWillResignActive() { dumpWindowInfo(); }

bool AppDelegate::applicationShouldSaveApplicationState() { return checkVaeloState(); }

bool AppDelegate::applicationShouldRestoreApplicationState() { return checkVaeloState(); }

void AppDelegate::applicationPerformActionForShortcutItemCompletionHandler(const ShortcutItem& item,
                                                                           std::function<void(bool)>) {
  VLO_INFO("Shortcut action: %{public}@", item.type);
  if (item.type == SearchShortcutType) {
    VLO_USER_ACTION("Firmpress: Search");
    if (const auto navigation = rootNavController()) navigation->startSearch("");
  } else if (item.type == RecentDocumentShortcutType) {
    VLO_USER_ACTION("Firmpress: Recent Document");
    openRecentDocument(item);
  }
}

void AppDelegate::openRecentDocument(const ShortcutItem& item) {
  std::optional<URL> url = archivedURLFor(item.userInfo, RecentDocumentAliasURLKey);
  const Value documentID = valueFor(item.userInfo, RecentDocumentDocIDKey);
  if (!url && documentID.isNumber()) url = vlo_URLFromDocumentID(std::to_string(documentID.unsignedValue()));
  if (!url) url = archivedURLFor(item.userInfo, RecentDocumentURLKey);
  if (!url) return;
  VLO_INFO("Shortcut recent document: %@", *url);
  if (const auto navigation = rootNavController()) navigation->warpToNewURLPreviewMode(url, 0);
}

bool AppDelegate::applicationContinueUserActivityRestorationHandler(const std::shared_ptr<UserActivity>& activity,
                                                                    std::function<void()>) {
  const std::string type = activity->activityType();
  if (type == SearchContinuationActivityType) {
    continueSearch(activity->userInfo());
  } else if (type == SearchResultActivityType) {
    openSearchResult(activity->userInfo());
  } else if (type == Settings::batonVaeloActivityType()) {
    openBatonDocument(activity->userInfo());
  } else {
    VLO_ERROR("Invalid user activity type %{public}@", type);
    return false;
  }
  return true;
}

void AppDelegate::continueSearch(const Dictionary& userInfo) {
  VLO_USER_ACTION("Quarry: Search Continuation");
  const std::optional<std::string> query = stringFor(userInfo, SearchQueryStringKey);
  VLO_INFO("Quarry Search Continuation: \"%@\"", query);
  if (!query) return;
  if (const auto navigation = rootNavController()) navigation->startSearch(*query);
}

void AppDelegate::openSearchResult(const Dictionary& userInfo) {
  VLO_USER_ACTION("Quarry: Open Search Result");
  const std::optional<std::string> documentID = stringFor(userInfo, SearchResultIdentifierKey);
  VLO_INFO("Quarry Search Result: open documentID \"%@\"", documentID);
  const std::optional<URL> url = vlo_URLFromDocumentID(documentID);
  if (!url) {
    VLO_ERROR("Can't get URL for DocumentID: %{public}@", documentID);
    return;
  }
  const URL resolved = vlo_URLByResolvingPromise(*url);
  VLO_INFO("Quarry documentID %{public}@ is URL: %@", documentID, resolved);
  warpSoon(resolved);
}

void AppDelegate::openBatonDocument(const Dictionary& userInfo) {
  VLO_USER_ACTION("Baton: Open Document");
  const std::optional<std::string> bookmark = stringFor(userInfo, UserActivityDocumentURLKey);
  VLO_INFO("Baton document bookmark: %{public}@", bookmark);
  const std::weak_ptr<AppDelegate> weakSelf = weak_from_this();
  Platform::current().fileProvider.DocumentURLFromBookmarkableString(
      bookmark.value_or(""), [weakSelf](const Result<URL>& result) { batonDocumentDecoded(weakSelf, result); });
}

void AppDelegate::batonDocumentDecoded(const std::weak_ptr<AppDelegate>& weakSelf, const Result<URL>& result) {
  if (result.error) {
    VLO_ERROR("Baton failed to decode bookmark: %{public}@", *result.error);
    return;
  }
  const std::shared_ptr<AppDelegate> self = weakSelf.lock();
  if (!self) return;
  VLO_INFO("Baton document URL: %@", result.value);
  self->warpSoon(result.value);
}

void AppDelegate::warpSoon(const std::optional<URL>& url) {
  Platform::current().queues.main().async([self = shared_from_this(), url] {
    if (const auto navigation = self->rootNavController()) navigation->warpToNewURLPreviewMode(url, 0);
  });
}

bool AppDelegate::applicationWillContinueUserActivityWithType(const std::string& type) {
  VLO_INFO("%s: activity type is %{public}@", __func__, type);
  return true;
}

void AppDelegate::applicationDidFailToContinueUserActivityWithTypeError(const std::string& type, const Error& error) {
  VLO_ERROR("%s: activity type is %{public}@: Error %{public}@", __func__, type, error);
}

bool AppDelegate::applicationRunTestOptions(const std::string&, const Dictionary&) { return false; }

std::shared_ptr<NavController> AppDelegate::rootNavController() const {
  return rootWindow_ ? std::dynamic_pointer_cast<NavController>(rootWindow_->rootViewController()) : nullptr;
}

bool AppDelegate::checkVaeloState() const {
  const auto navigation = rootNavController();
  return navigation && navigation->checkVaeloState();
}

}  // namespace vaelo
