// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <algorithm>
#include <map>
#include <memory>
#include <set>
#include <string>
#include <utility>
#include <vector>

#include "app/app_delegate.h"
#include "platform/ui/screen_factory.h"
#include "tests/unit/app_fixture.h"

namespace vaelo {

/// Knows a bookmark and a promise besides what the drive knows.
class CloudWithReferences : public CloudDocuments {
 public:
  explicit CloudWithReferences(CloudDocuments& cloud) : cloud_(cloud) {}
  std::map<std::string, URL> bookmarks;
  std::map<std::string, URL> promises;

  bool isExternalDocumentReference(const URL& url) override { return bookmarks.contains(url.path()); }
  Result<URL> resolveExternalDocumentReference(const URL& url) override {
    const auto found = bookmarks.find(url.path());
    if (found == bookmarks.end()) return cloud_.resolveExternalDocumentReference(url);
    const URL target = found->second;
    if (target.path() == "/") return Error{FileErrorDomain, FileErrorCode::NoSuchFile, {}, "gone", {}};
    return target;
  }
  bool isPromise(const URL& url) override { return promises.contains(url.path()); }
  URL logicalURLOfPromise(const URL& url) override { return promises.at(url.path()); }

  std::optional<UbiquityIdentityToken> ubiquityIdentityToken() override { return cloud_.ubiquityIdentityToken(); }
  std::string defaultContainerIdentifier() override { return cloud_.defaultContainerIdentifier(); }
  std::vector<CloudContainerRef> allContainers() override { return cloud_.allContainers(); }
  CloudContainerRef containerWithIdentifier(const std::string& id) override { return cloud_.containerWithIdentifier(id); }
  Result<CloudContainerRef> containerForURL(const URL& url) override { return cloud_.containerForURL(url); }
  std::optional<std::string> containerIdentifierForURL(const URL& url) override {
    return cloud_.containerIdentifierForURL(url);
  }
  bool isDocumentsContainer(const URL& url) override { return cloud_.isDocumentsContainer(url); }
  std::optional<URL> defaultContainerURL() override { return cloud_.defaultContainerURL(); }
  std::optional<std::string> pathRelativeToMirror(const URL& url) override { return cloud_.pathRelativeToMirror(url); }
  bool URLIsInDriveMirror(const URL& url) override { return cloud_.URLIsInDriveMirror(url); }
  bool URLIsInDriveTrash(const URL& url) override { return cloud_.URLIsInDriveTrash(url); }
  URL realPathURL(const URL& url) override { return cloud_.realPathURL(url); }
  URL physicalURL(const URL& url) override { return cloud_.physicalURL(url); }
  Result<std::vector<std::string>> tagNames(const URL& url) override { return cloud_.tagNames(url); }
  bool canMoveWithoutDownloading(const CloudContainer& from, const CloudContainer& to) override {
    return cloud_.canMoveWithoutDownloading(from, to);
  }
  std::optional<Error> evict(const URL& url) override { return cloud_.evict(url); }
  void fetchQuota(std::function<void(Result<std::int64_t>)> done) override { cloud_.fetchQuota(std::move(done)); }

 private:
  CloudDocuments& cloud_;
};

/// Remembers who follows a document.
class FollowedDocuments : public FileCoordination {
 public:
  explicit FollowedDocuments(FileCoordination& files) : files_(files) {}
  std::unique_ptr<FileCoordinator> makeCoordinator(FilePresenter* presenter) override {
    return files_.makeCoordinator(presenter);
  }
  void addFilePresenter(FilePresenter& presenter) override { presenters.insert(&presenter); }
  void removeFilePresenter(FilePresenter& presenter) override { presenters.erase(&presenter); }
  bool isFollowedBy(const std::shared_ptr<PreviewItemManager>& manager) const { return presenters.contains(manager.get()); }
  std::set<FilePresenter*> presenters;

 private:
  FileCoordination& files_;
};

/// Decodes a bookmark at once, on the caller's stack.
class PromptFileProvider : public FileProvider {
 public:
  void BookmarkableStringFromDocumentURL(const URL&, std::function<void(Result<std::string>)>) override {}
  void DocumentURLFromBookmarkableString(const std::string& text, std::function<void(Result<URL>)> done) override {
    done(URL(text));
  }
};

/// Shows everything at once and keeps what was to be animated.
class AnimationRecorder : public NavigationHost, public PresentationHost {
 public:
  void stackChanged(const Stack&, const Stack&, bool animated, std::function<void()> done) override {
    stacks.push_back(animated);
    done();
  }
  void toolbarHiddenChanged(bool, bool) override {}
  void present(const ViewControllerRef&, const ViewControllerRef&, bool, std::function<void()> done) override { done(); }
  void dismiss(const ViewControllerRef&, bool animated, std::function<void()> done) override {
    dismissals.push_back(animated);
    done();
  }
  std::vector<bool> stacks;
  std::vector<bool> dismissals;
};

/// The fixture's platform with a few services that remember more.
class NavReviewTest : public AppFixture {
 protected:
  NavReviewTest() { Platform::install(&swapped); }
  ~NavReviewTest() override {
    if (nav) nav->setHost(nullptr);
    delegate = nullptr;
    window = nullptr;
    nav = nullptr;
    Platform::install(&original);
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

  Platform& original = Platform::current();
  CloudWithReferences cloud{original.cloudDocuments};
  FollowedDocuments files{original.fileCoordination};
  PromptFileProvider provider;
  Platform swapped = [this] {
    return Platform{original.application,
                    original.activityTracing,
                    cloud,
                    original.characterClasses,
                    original.documentStore,
                    files,
                    original.fileManager,
                    original.fileProgress,
                    provider,
                    original.formatting,
                    original.launchServices,
                    original.log,
                    original.notifications,
                    original.offers,
                    original.preferences,
                    original.queues,
                    original.resourceValues,
                    original.screens,
                    original.types,
                    original.userActivities};
  }();
  AnimationRecorder shown;
  WindowRef window = std::make_shared<Window>();
  std::shared_ptr<AppDelegate> delegate;
  URL document = addFile("Plans/a.txt");
  URL other = addFile("Plans/b.txt");
};

}  // namespace vaelo
