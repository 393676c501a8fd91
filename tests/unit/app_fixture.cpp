// SPDX-License-Identifier: GPL-3.0-or-later
#include "tests/unit/app_fixture.h"

#include <deque>
#include <set>

#include "platform/archive.h"
#include "tests/support/memory_file_progress.h"
#include "tests/support/memory_user_activities.h"
#include "tests/unit/app_world.h"

namespace vaelo {

using namespace app_world;

/// Everything that the application asks of a platform, and no more than it asks for.
struct AppWorld : Application,
                  ActivityTracing,
                  CloudDocuments,
                  CharacterClasses,
                  DocumentStore,
                  FileCoordination,
                  FileManager,
                  FileProvider,
                  Formatting,
                  LaunchServices,
                  OfferManager,
                  Preferences,
                  Queues,
                  ResourceValues,
                  ScreenFactory,
                  TypeIdentifiers,
                  Graphics,
                  Device {
  struct Node {
    FileType type = FileType::Regular;
    std::string target;
    std::int64_t documentID = 0;
  };

  AppWorld()
      : platform{*this, *this,       *this,         *this, *this, *this, *this, fileProgress, *this, *this,
                 *this, recordedLog, notifications, *this, *this, *this, *this, *this,        *this, userActivities} {
    addFolder(Drive);
    Platform::install(&platform);
  }
  ~AppWorld() { Platform::install(nullptr); }

  void addFolder(const URL& url) {
    for (URL above = url; above.path() != "/"; above = above.deletingLastPathComponent()) {
      nodes[above.path()].type = FileType::Directory;
    }
  }
  URL add(const URL& url, Node node) {
    addFolder(url.deletingLastPathComponent());
    nodes[url.path()] = std::move(node);
    return url;
  }
  Node* nodeAt(const std::string& path) {
    const auto found = nodes.find(path);
    return found == nodes.end() ? nullptr : &found->second;
  }
  static bool isPackage(const URL& url) { return url.pathExtension() == "sketchbundle"; }

  // Application and tracing
  int run(int, char**, std::function<std::shared_ptr<ApplicationDelegate>()> makeDelegate) override {
    return makeDelegate() ? 23 : 0;
  }
  bool isRightToLeft() override { return false; }
  std::string description() override { return "application"; }
  void recordUserAction(const std::string& label) override { actions.push_back(label); }

  // CloudDocuments
  std::optional<UbiquityIdentityToken> ubiquityIdentityToken() override { return account; }
  std::string defaultContainerIdentifier() override { return Drive.lastPathComponent(); }
  std::vector<CloudContainerRef> allContainers() override { return {std::make_shared<DriveContainer>()}; }
  CloudContainerRef containerWithIdentifier(const std::string& identifier) override {
    return identifier == defaultContainerIdentifier() ? std::make_shared<DriveContainer>() : nullptr;
  }
  Result<CloudContainerRef> containerForURL(const URL& url) override {
    if (!url.isInside(Drive)) return noSuchFile();
    return CloudContainerRef(std::make_shared<DriveContainer>());
  }
  std::optional<std::string> containerIdentifierForURL(const URL& url) override {
    return url.isInside(Drive) ? std::optional(defaultContainerIdentifier()) : std::nullopt;
  }
  bool isDocumentsContainer(const URL& url) override { return url == Drive; }
  std::optional<URL> defaultContainerURL() override { return account ? std::optional(Drive) : std::nullopt; }
  std::optional<std::string> pathRelativeToMirror(const URL& url) override {
    if (!url.isInside(Mirror) || url == Mirror) return std::nullopt;
    return url.path().substr(Mirror.path().size() + 1);
  }
  bool URLIsInDriveMirror(const URL& url) override { return url.isInside(Mirror); }
  bool URLIsInDriveTrash(const URL& url) override { return url.isInside(Mirror.appendingPathComponent(".Trash")); }
  URL realPathURL(const URL& url) override { return resolvingSymlinks(url); }
  bool isExternalDocumentReference(const URL&) override { return false; }
  Result<URL> resolveExternalDocumentReference(const URL&) override { return noSuchFile(); }
  bool isPromise(const URL&) override { return false; }
  URL logicalURLOfPromise(const URL& url) override { return url; }
  URL physicalURL(const URL& url) override { return url; }
  Result<std::vector<std::string>> tagNames(const URL&) override { return std::vector<std::string>{}; }
  bool canMoveWithoutDownloading(const CloudContainer&, const CloudContainer&) override { return false; }
  std::optional<Error> evict(const URL&) override { return std::nullopt; }
  void fetchQuota(std::function<void(Result<std::int64_t>)> done) override {
    ++quotaFetches;
    done(quota);
  }

  // CharacterClasses
  bool containsIllegalCharacter(const std::string&) override { return false; }
  bool containsControlCharacter(const std::string&) override { return false; }
  bool containsNewline(const std::string&) override { return false; }
  std::string trimmingWhitespaceAndNewlines(const std::string& text) override { return text; }
  bool localizedCaseInsensitiveEquals(const std::string& a, const std::string& b) override { return a == b; }

  // DocumentStore: the file identifier is the document's, and so is the handle
  std::optional<DocumentStore::Device> deviceOf(const URL&) override { return 1; }
  SystemResult<FileID> resolveDocumentID(DocumentStore::Device, std::uint64_t documentID) override {
    return pathOf(static_cast<std::int64_t>(documentID)) ? SystemResult<FileID>{documentID, {}}
                                                         : SystemResult<FileID>{std::nullopt, {2, "No such file"}};
  }
  SystemResult<int> openByID(DocumentStore::Device, FileID file) override { return {static_cast<int>(file), {}}; }
  SystemResult<OpenFileAttributes> attributesOfOpenFile(int handle) override {
    return {OpenFileAttributes{handle, *pathOf(handle)}, {}};
  }
  void close(int) override {}
  std::optional<std::string> pathOf(std::int64_t documentID) {
    for (const auto& [path, node] : nodes) {
      if (documentID && node.documentID == documentID) return path;
    }
    return std::nullopt;
  }

  // Files
  std::unique_ptr<FileCoordinator> makeCoordinator(FilePresenter*) override { return std::make_unique<Coordinator>(); }
  void addFilePresenter(FilePresenter&) override {}
  void removeFilePresenter(FilePresenter&) override {}
  bool fileExistsAtPath(const std::string& path, bool* isDirectory) override {
    const Node* node = nodeAt(resolvingSymlinks(URL(path)).path());
    if (isDirectory) *isDirectory = node && node->type == FileType::Directory;
    return node != nullptr;
  }
  Result<FileAttributes> attributesOfItemAtPath(const std::string& path) override {
    const Node* node = nodeAt(path);
    if (!node) return noSuchFile();
    FileAttributes attributes;
    attributes.type = node->type;
    return attributes;
  }
  Result<std::string> destinationOfSymbolicLinkAtPath(const std::string& path) override {
    const Node* node = nodeAt(path);
    if (!node || node->type != FileType::SymbolicLink) return noSuchFile();
    return node->target;
  }
  std::optional<Error> createDirectoryAtURL(const URL&) override { return std::nullopt; }
  std::optional<Error> removeItemAtURL(const URL&) override { return std::nullopt; }
  std::optional<Error> moveItemAtURL(const URL&, const URL&) override { return std::nullopt; }
  void enumerate(const URL&, const std::vector<ResourceKey>&, unsigned, const std::function<bool(const URL&)>&,
                 const std::function<bool(const URL&, const Error&)>&) override {}
  std::vector<std::string> userDocumentsDirectories() override { return {}; }
  std::string expandingTilde(const std::string& path) override { return path; }
  Result<ResourceMap> promisedItemResourceValues(const URL& url, const std::vector<ResourceKey>& keys) override {
    return resourceValues(url, keys);
  }
  Result<ResourceMap> resourceValues(const URL& url, const std::vector<ResourceKey>&) override {
    const Node* node = nodeAt(url.path());
    if (!node) return noSuchFile();
    const bool folder = node->type == FileType::Directory;
    const char* type = folder ? "public.folder" : "public.data";
    if (node->type == FileType::SymbolicLink) type = "public.symlink";
    ResourceMap values{{ResourceKey::Name, url.lastPathComponent()},
                       {ResourceKey::TypeIdentifier, type},
                       {ResourceKey::IsDirectory, folder},
                       {ResourceKey::IsPackage, folder && isPackage(url)},
                       {ResourceKey::IsRegularFile, node->type == FileType::Regular},
                       {ResourceKey::ParentDirectoryURL, url.deletingLastPathComponent()}};
    return values;
  }
  bool promisedItemIsReachable(const URL& url) override { return nodeAt(url.path()) != nullptr; }
  /// One link at a time, so that a link to a link leads to a link.
  URL resolvingSymlinks(const URL& url) override {
    const Node* node = nodeAt(url.path());
    if (!node || node->type != FileType::SymbolicLink) return url;
    const Node* target = nodeAt(node->target);
    return URL(node->target, target && target->type == FileType::Directory);
  }
  Result<URL> resolveAliasFile(const URL&) override { return noSuchFile(); }
  bool startAccessingSecurityScopedResource(const URL&) override { return false; }
  void stopAccessingSecurityScopedResource(const URL&) override {}
  void BookmarkableStringFromDocumentURL(const URL& url, std::function<void(Result<std::string>)> done) override {
    done(url.path());
  }
  void DocumentURLFromBookmarkableString(const std::string& text, std::function<void(Result<URL>)> done) override {
    main_.async([this, text, done] { done(nodeAt(text) ? Result<URL>(URL(text)) : Result<URL>(noSuchFile())); });
  }

  // Formatting and types
  std::string byteCount(std::uint64_t bytes, ByteCountStyle style, bool withUnit) override {
    return std::to_string(bytes / (style == ByteCountStyle::Binary ? 1024 : 1000)) + (withUnit ? " KB" : "");
  }
  std::string localizedDate(Date, DateStyle, DateStyle) override { return "date"; }
  std::string localizedString(const std::string& key) override { return key; }
  std::string localizedAmount(const std::string&, double number, const std::string& text) override {
    return text + " (" + std::to_string(static_cast<int>(number)) + ") available";
  }
  std::string localizedCount(const std::string& key, std::int64_t count) override {
    return (key == ".DICT.ITEMS.%d" ? "items: " : "selected: ") + std::to_string(count);
  }
  std::string filled(const std::string& format, const std::vector<std::string>& arguments) override {
    std::string text = format;
    for (std::size_t i = 0; i < arguments.size(); ++i) {
      const std::string mark = "%" + std::to_string(i + 1) + "$@";
      const std::size_t at = text.find(mark);
      if (at != std::string::npos) text.replace(at, mark.size(), arguments[i]);
    }
    return text;
  }
  std::optional<std::string> preferredIdentifierForExtension(const std::string& extension) override {
    return "dyn." + extension;
  }
  bool conformsTo(const std::string&, const std::string&) override { return false; }
  std::optional<std::string> description(const std::string&) override { return std::nullopt; }

  // Other services
  std::shared_ptr<DocumentRecord> documentRecord(const URL& url, bool) override {
    return std::make_shared<Record>(url, owned.contains(url));
  }
  std::optional<ApplicationRecord> applicationRecord(const std::string&) override { return std::nullopt; }
  std::string ownBundleIdentifier() override { return "com.marrow.VaeloDrive"; }
  bool fetchOfferIfNeeded() override { return offerIsBeingFetched; }
  StorageOfferRef currentOffer() override { return offer; }
  std::optional<Data> dataForKey(const std::string& key) override {
    const auto found = kept.find(key);
    return found == kept.end() ? std::nullopt : std::optional(found->second);
  }
  void setDataForKey(const std::string& key, const Data& data) override { kept[key] = data; }
  void removeKey(const std::string& key) override { kept.erase(key); }

  // Queues
  DispatchQueue& main() override { return main_; }
  std::shared_ptr<DispatchQueue> makeSerialQueue(const std::string& label) override {
    return std::make_shared<ClockQueue>(clock, label);
  }
  std::shared_ptr<OperationQueue> makeOperationQueue(const std::string& name, QualityOfService quality) override {
    return std::make_shared<ClockOperations>(clock, name, quality);
  }
  std::unique_ptr<TimerSource> makeTimer(std::shared_ptr<DispatchQueue>, std::chrono::nanoseconds interval,
                                         std::chrono::nanoseconds, Block handler) override {
    return std::make_unique<ClockTimer>(clock, interval, std::move(handler));
  }
  Date now() override { return clock->date(); }

  // Screens
  Graphics& graphics() override { return *this; }
  vaelo::Device& device() override { return *this; }
  WindowRef makeWindow(const Rect& bounds) override { return std::make_shared<Window>(bounds); }
  DocumentListControllerRef makeRootList() override {
    if (noRootList) return nullptr;
    const auto list = std::make_shared<DocumentListController>(Drive, true);
    list->setTitle("Vaelo Drive");
    return list;
  }
  DocumentListControllerRef makeList(const URL& folder) override {
    const auto list = std::make_shared<DocumentListController>(folder);
    list->setTitle(folder.lastPathComponent());
    return list;
  }
  std::optional<std::vector<DocumentListControllerRef>> hierarchyTo(const URL& folder) override {
    if (noHierarchies || !folder.isInside(Drive)) return std::nullopt;
    std::deque<DocumentListControllerRef> lists;
    for (URL above = folder; !(above == Drive); above = above.deletingLastPathComponent()) {
      lists.push_front(makeList(above));
    }
    lists.push_front(makeRootList());
    return std::vector<DocumentListControllerRef>(lists.begin(), lists.end());
  }
  ViewControllerRef makeDriveUnavailable() override {
    return noUnavailableScreen ? nullptr : std::make_shared<Unavailable>();
  }
  bool canPreviewItem(const URL& url) override { return !unpreviewable.contains(url); }
  std::shared_ptr<DocumentInteractionController> makeDocumentInteraction(const URL& url) override {
    return std::make_shared<Interaction>(url);
  }
  std::shared_ptr<UpgradeFlowManager> makeUpgradeFlow(StorageOfferRef flowOffer) override {
    return std::make_shared<Flow>(std::move(flowOffer), flowPresenter);
  }
  void runPreOpenAlert(const URL&, const ViewControllerRef& presenter, std::function<void()> open) override {
    openingPresenter = presenter;
    open();
  }
  FontMetrics fontMetrics(const Font& font) override { return {font.pointSize, font.pointSize, 0, 0, font.pointSize}; }
  Size measure(const std::string& text, const Font& font, double, int) override {
    return {static_cast<double>(text.size()) * 5, text.empty() ? 0 : font.pointSize};
  }
  ImageRef renderImage(const Size&, const std::function<void(DrawingContext&)>&) override { return nullptr; }
  ImageRef documentIcon(const std::string&, const std::optional<std::string>&, IconFormat) override { return nullptr; }
  InterfaceIdiom userInterfaceIdiom() override { return idiom; }
  Screen mainScreen() override { return {{0, 0, 360, 720}, 2}; }
  Rect statusBarFrame() override { return {}; }
  InterfaceOrientation statusBarOrientation() override { return InterfaceOrientation::Portrait; }

  std::shared_ptr<Clock> clock = std::make_shared<Clock>();
  ClockQueue main_{clock, "main"};
  RecordingLog recordedLog;
  NotificationCenter notifications;
  std::map<std::string, Node> nodes;
  std::vector<std::string> actions;
  std::optional<UbiquityIdentityToken> account = UbiquityIdentityToken{"somebody"};
  std::map<std::string, Data> kept;
  StorageOfferRef offer;
  bool offerIsBeingFetched = false;
  Result<std::int64_t> quota{std::int64_t{4096}};
  int quotaFetches = 0;
  MemoryFileProgress fileProgress;
  MemoryUserActivities userActivities;
  bool noRootList = false;
  bool noUnavailableScreen = false;
  bool noHierarchies = false;
  InterfaceIdiom idiom = InterfaceIdiom::Phone;
  ViewControllerRef openingPresenter;
  std::set<URL> unpreviewable;
  std::set<URL> owned;
  ViewControllerRef flowPresenter;
  Platform platform;
};

AppFixture::AppFixture() : world_(std::make_unique<AppWorld>()) {}

AppFixture::~AppFixture() {
  nav = nullptr;
  // The shared preview screen lives for the whole process; the next test finds it as at the start.
  const auto& glimpse = GlimpseItemController::defaultController();
  glimpse->removeFromParent();
}

URL AppFixture::addFolder(const std::string& path) {
  const URL url = Drive.appendingPathComponent(path, true);
  world_->addFolder(url);
  return url;
}
URL AppFixture::addFile(const std::string& path) { return world_->add(Drive.appendingPathComponent(path), {}); }
URL AppFixture::addLink(const std::string& path, const URL& target) {
  return world_->add(Drive.appendingPathComponent(path), {FileType::SymbolicLink, target.path(), 0});
}
URL AppFixture::addTrashedFile(const std::string& name) {
  return world_->add(Mirror.appendingPathComponent(".Trash").appendingPathComponent(name), {});
}
URL AppFixture::addOutsideFile(const std::string& path) { return world_->add(URL(path), {}); }
void AppFixture::giveDocumentID(const URL& url, std::int64_t number) { world_->nodes[url.path()].documentID = number; }
void AppFixture::makePreviewable(const URL& url) { world_->unpreviewable.erase(url); }
void AppFixture::makeUnpreviewable(const URL& url) { world_->unpreviewable.insert(url); }
void AppFixture::giveOwningApplication(const URL& document) { world_->owned.insert(document); }
std::string AppFixture::bookmarkableString(const URL& url) { return url.path(); }

void AppFixture::signIn(const std::string& account) { world_->account = UbiquityIdentityToken{account}; }
void AppFixture::signOut() { world_->account.reset(); }
std::optional<UbiquityIdentityToken> AppFixture::token() { return world_->account; }
std::optional<UbiquityIdentityToken> AppFixture::savedToken() {
  const auto data = world_->dataForKey("com.marrow.VaeloDriveApp.UbiquityIdentityToken");
  return data ? unarchiveToken(*data) : std::nullopt;
}
void AppFixture::identityChanged() { world_->notifications.post({IdentityDidChangeNotification, {}}); }
void AppFixture::becomeActive() { world_->notifications.post({DidBecomeActiveNotification, {}}); }
void AppFixture::resignActive() { world_->notifications.post({WillResignActiveNotification, {}}); }
void AppFixture::setOffer(int level) { world_->offer = std::make_shared<Offer>(level); }
void AppFixture::fetchOfferOnRequest() { world_->offerIsBeingFetched = true; }
void AppFixture::offerChanged() { world_->notifications.post({OfferChangedNotification, {}}); }
ViewControllerRef AppFixture::upgradeFlowPresenter() { return world_->flowPresenter; }
void AppFixture::setFreeBytes(std::int64_t bytes) { world_->quota = Result<std::int64_t>(bytes); }
void AppFixture::failQuota(const Error& error) { world_->quota = Result<std::int64_t>(error); }
int AppFixture::quotaFetches() { return world_->quotaFetches; }

void AppFixture::loadNav() {
  nav = std::make_shared<NavController>();
  nav->view();
}
std::shared_ptr<DocumentListController> AppFixture::makeList(const URL& folder) { return world_->makeList(folder); }
std::shared_ptr<DocumentListController> AppFixture::topList() { return nav->getTopDocumentListController(); }
void AppFixture::makeNoRootList() { world_->noRootList = true; }
void AppFixture::makeNoUnavailableScreen() { world_->noUnavailableScreen = true; }
void AppFixture::makeNoHierarchies() { world_->noHierarchies = true; }
void AppFixture::makeTablet() { world_->idiom = InterfaceIdiom::Slate; }
ViewControllerRef AppFixture::openingPresenter() { return world_->openingPresenter; }
void AppFixture::presentSomething() { nav->presentViewController(std::make_shared<ViewController>(), false); }
std::shared_ptr<AlertController> AppFixture::presentedAlert() {
  return std::dynamic_pointer_cast<AlertController>(nav->presentedViewController());
}
std::string AppFixture::statusText() { return statusBarOf(*topList())->primaryLabel()->text(); }

void AppFixture::advance(std::chrono::nanoseconds time) { world_->clock->advance(time); }
RecordingLog& AppFixture::log() { return world_->recordedLog; }
bool AppFixture::loggedStarting(const std::string& level, const std::string& start) {
  const std::vector<std::string> lines = log().lines();
  return std::any_of(lines.begin(), lines.end(), [&](const std::string& line) {
    return line.starts_with("(VLO)[" + level + "] ") && line.find(") " + start) != std::string::npos;
  });
}
const std::vector<std::string>& AppFixture::userActions() { return world_->actions; }
int AppFixture::exitStatusOfLoop() { return 23; }
std::shared_ptr<UserActivity> AppFixture::makeActivity(const std::string& type, Dictionary userInfo) {
  const auto activity = std::make_shared<Activity>();
  activity->type = type;
  activity->setUserInfo(std::move(userInfo));
  return activity;
}

}  // namespace vaelo
