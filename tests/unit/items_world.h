// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <gtest/gtest.h>

#include <cstdio>
#include <map>
#include <memory>
#include <set>
#include <string>
#include <vector>

#include "platform/platform.h"
#include "platform/ui/screen_factory.h"
#include "tests/support/memory_file_progress.h"
#include "tests/support/memory_user_activities.h"
#include "tests/support/recording_log.h"

namespace vaelo {

inline const URL Mirror("/drive/mirror", true);
inline const URL Drive("/drive/mirror/com~marrow~Kestrel", true);
inline const URL Library("/drive/mirror/org~example~Sketchbook", true);
inline const URL LibraryDocuments("/drive/mirror/org~example~Sketchbook/Documents", true);
inline constexpr const char* DriveIdentifier = "com~marrow~Kestrel";
inline constexpr const char* LibraryIdentifier = "org~example~Sketchbook";

inline Error fileError(int code) { return {FileErrorDomain, code, {}, {}, {}}; }

/// A log that keeps the types of its lines too.
struct TypedLog : RecordingLog {
  void write(LogType type, const std::string& line) override {
    types.push_back(type);
    RecordingLog::write(type, line);
    if (echoes) std::fprintf(stderr, "%s\n", line.c_str());
  }
  bool wantsDebug() override { return debugIsWanted; }
  std::vector<LogType> types;
  bool debugIsWanted = true;
  bool echoes = false;  ///< to the error stream, which outlives the program
};

/// A container whose answers a test sets.
struct TestContainer : CloudContainer {
  TestContainer(std::string id, std::string name, std::optional<URL> folder)
      : identifier_(std::move(id)), name_(std::move(name)), folder_(std::move(folder)) {}
  std::string identifier() const override { return identifier_; }
  std::string localizedName() const override { return name_; }
  std::optional<URL> documentsFolderURL() const override { return folder_; }
  std::optional<std::vector<DeclaredDocumentType>> documentTypes() const override { return types_; }
  std::optional<std::string> supportedFolderLevels() const override { return std::nullopt; }
  std::vector<std::string> ownerBundleIdentifiers() const override { return owners_; }
  std::optional<Error> deleteAllContents() override { return std::nullopt; }

  std::string identifier_;
  std::string name_;
  std::optional<URL> folder_;
  std::optional<std::vector<DeclaredDocumentType>> types_;
  std::vector<std::string> owners_;
};

/// What a test says of one path.
struct WorldItem {
  FileType type = FileType::Regular;
  /// The resource values; those of a promise are known to the promised-item forms alone.
  ResourceMap values;
  bool isPromise = false;
  std::string linkTarget;
  FileAttributes attributes;
};

/// A drive in memory, whose errors and interleavings a test chooses; it keeps what was asked of it, in order.
class ItemsWorld : public Application,
                   public ActivityTracing,
                   public CloudDocuments,
                   public CharacterClasses,
                   public DocumentStore,
                   public FileCoordination,
                   public FileManager,
                   public FileProvider,
                   public Formatting,
                   public LaunchServices,
                   public OfferManager,
                   public Preferences,
                   public Queues,
                   public ResourceValues,
                   public ScreenFactory,
                   public TypeIdentifiers {
 public:
  ItemsWorld();
  ~ItemsWorld() override;

  WorldItem& addFile(const URL& url, ResourceMap values = {});
  WorldItem& addFolder(const URL& url, ResourceMap values = {});
  /// Position of a call in `calls`; -1 when it was not made.
  int indexOf(const std::string& call) const;
  bool called(const std::string& call) const { return indexOf(call) >= 0; }

  // What was asked, as "operation path".
  std::vector<std::string> calls;
  TypedLog recordedLog;
  std::vector<std::string> userActions;
  std::vector<ResourceKey> lastKeys;
  unsigned lastOptions = 0;

  // The file system.
  std::map<std::string, WorldItem> items;
  std::set<std::string> unreachable;
  std::map<std::string, Result<ResourceMap>> promisedAnswers;  ///< instead of the item's values
  std::map<std::string, Result<ResourceMap>> plainAnswers;
  std::optional<Error> createError, removeError, moveError;
  std::optional<Error> enumerationError;
  std::map<std::string, URL> linkTargets;
  std::map<std::string, Result<URL>> aliasTargets;
  bool securityScoped = false;
  std::vector<std::string> documentsDirectories;

  // Coordination.
  std::optional<Error> coordinatorError;  ///< the accessor is not run then, unless errorAfterAccessor
  bool errorAfterAccessor = false;
  std::map<std::string, URL> redirected;  ///< the URL that an accessor gets for another
  std::function<void()> beforeAccessor;

  // The cloud.
  std::shared_ptr<TestContainer> drive, library;
  std::vector<CloudContainerRef> containers;
  std::optional<Error> containerError;
  bool containerErrorComesWithValue = false;
  std::map<std::string, Result<URL>> bookmarks;
  std::map<std::string, URL> logicalOfPromise;
  std::map<std::string, URL> physicalOfLogical;
  std::map<std::string, Result<std::vector<std::string>>> tags;
  std::set<std::string> movableTo;  ///< identifiers of containers
  std::optional<Error> evictError;

  // The document store: handles are file identifiers.
  SystemResult<FileID> resolvedFile{FileID{7}, {}};
  SystemResult<int> openedHandle{7, {}};
  SystemResult<OpenFileAttributes> openAttributes{OpenFileAttributes{}, {}};
  std::optional<Device> device_ = 5;
  std::set<Device> devices;  ///< that were asked

  // Applications and types.
  std::map<std::string, std::string> typeOfExtension;
  std::map<std::string, std::set<std::string>> conformances;
  std::map<std::string, std::string> descriptions;
  Result<DocumentRecord::Ranked> ranked{DocumentRecord::Ranked{}};
  std::map<std::string, ApplicationRecord> applications;
  std::set<std::string> unpreviewable;
  bool holdsOpening = false;
  bool opensInPlace = true;
  std::function<void()> heldOpening;
  ViewControllerRef openingPresenter;
  bool rightToLeft = false;
  Date now_{};

  // Application, ActivityTracing
  int run(int, char**, std::function<std::shared_ptr<ApplicationDelegate>()>) override { return 0; }
  bool isRightToLeft() override { return rightToLeft; }
  std::string description() override { return "application"; }
  void recordUserAction(const std::string& label) override { userActions.push_back(label); }

  // CloudDocuments
  std::optional<UbiquityIdentityToken> ubiquityIdentityToken() override { return std::nullopt; }
  std::string defaultContainerIdentifier() override { return DriveIdentifier; }
  std::vector<CloudContainerRef> allContainers() override { return containers; }
  CloudContainerRef containerWithIdentifier(const std::string& identifier) override;
  Result<CloudContainerRef> containerForURL(const URL& url) override;
  std::optional<std::string> containerIdentifierForURL(const URL& url) override;
  bool isDocumentsContainer(const URL& url) override;
  std::optional<URL> defaultContainerURL() override { return Drive; }
  std::optional<std::string> pathRelativeToMirror(const URL& url) override;
  bool URLIsInDriveMirror(const URL& url) override { return url.isInside(Mirror); }
  bool URLIsInDriveTrash(const URL&) override { return false; }
  URL realPathURL(const URL& url) override { return url; }
  bool isExternalDocumentReference(const URL& url) override { return bookmarks.contains(url.path()); }
  Result<URL> resolveExternalDocumentReference(const URL& url) override;
  bool isPromise(const URL& url) override { return logicalOfPromise.contains(url.path()); }
  URL logicalURLOfPromise(const URL& url) override;
  URL physicalURL(const URL& url) override;
  Result<std::vector<std::string>> tagNames(const URL& url) override;
  bool canMoveWithoutDownloading(const CloudContainer& from, const CloudContainer& to) override;
  std::optional<Error> evict(const URL& url) override;
  void fetchQuota(std::function<void(Result<std::int64_t>)>) override {}

  // CharacterClasses: ASCII; a backslash stands for what is illegal
  bool containsIllegalCharacter(const std::string& text) override;
  bool containsControlCharacter(const std::string& text) override;
  bool containsNewline(const std::string& text) override;
  std::string trimmingWhitespaceAndNewlines(const std::string& text) override { return text; }
  bool localizedCaseInsensitiveEquals(const std::string& a, const std::string& b) override;

  // DocumentStore
  std::optional<Device> deviceOf(const URL& folder) override;
  SystemResult<FileID> resolveDocumentID(Device device, std::uint64_t documentID) override;
  SystemResult<int> openByID(Device device, FileID file) override;
  SystemResult<OpenFileAttributes> attributesOfOpenFile(int handle) override;
  void close(int handle) override;

  // Files
  std::unique_ptr<FileCoordinator> makeCoordinator(FilePresenter* presenter) override;
  void addFilePresenter(FilePresenter&) override {}
  void removeFilePresenter(FilePresenter&) override {}
  bool fileExistsAtPath(const std::string& path, bool* isDirectory) override;
  Result<FileAttributes> attributesOfItemAtPath(const std::string& path) override;
  Result<std::string> destinationOfSymbolicLinkAtPath(const std::string& path) override;
  std::optional<Error> createDirectoryAtURL(const URL& url) override;
  std::optional<Error> removeItemAtURL(const URL& url) override;
  std::optional<Error> moveItemAtURL(const URL& source, const URL& destination) override;
  void enumerate(const URL& url, const std::vector<ResourceKey>& prefetch, unsigned options,
                 const std::function<bool(const URL&)>& visit,
                 const std::function<bool(const URL&, const Error&)>& onError) override;
  std::vector<std::string> userDocumentsDirectories() override { return documentsDirectories; }
  std::string expandingTilde(const std::string& path) override;
  Result<ResourceMap> promisedItemResourceValues(const URL& url, const std::vector<ResourceKey>& keys) override;
  Result<ResourceMap> resourceValues(const URL& url, const std::vector<ResourceKey>& keys) override;
  bool promisedItemIsReachable(const URL& url) override;
  URL resolvingSymlinks(const URL& url) override;
  Result<URL> resolveAliasFile(const URL& url) override;
  bool startAccessingSecurityScopedResource(const URL& url) override;
  void stopAccessingSecurityScopedResource(const URL& url) override;

  // Formatting, types
  std::string byteCount(std::uint64_t bytes, ByteCountStyle style, bool withUnit) override;
  std::string localizedDate(Date date, DateStyle dateStyle, DateStyle timeStyle) override;
  std::string localizedString(const std::string& key) override { return key; }
  std::string localizedCount(const std::string& key, std::int64_t) override { return key; }
  std::string localizedAmount(const std::string& key, double, const std::string&) override { return key; }
  std::string filled(const std::string& format, const std::vector<std::string>&) override { return format; }
  std::optional<std::string> preferredIdentifierForExtension(const std::string& extension) override;
  bool conformsTo(const std::string& type, const std::string& other) override;
  std::optional<std::string> description(const std::string& type) override;

  // Other services
  std::shared_ptr<DocumentRecord> documentRecord(const URL& url, bool sourceIsManaged) override;
  std::optional<ApplicationRecord> applicationRecord(const std::string& bundleIdentifier) override;
  std::string ownBundleIdentifier() override { return "com.marrow.VaeloDrive"; }
  void BookmarkableStringFromDocumentURL(const URL&, std::function<void(Result<std::string>)>) override {}
  void DocumentURLFromBookmarkableString(const std::string&, std::function<void(Result<URL>)>) override {}
  bool fetchOfferIfNeeded() override { return false; }
  StorageOfferRef currentOffer() override { return nullptr; }
  std::optional<Data> dataForKey(const std::string&) override { return std::nullopt; }
  void setDataForKey(const std::string&, const Data&) override {}
  void removeKey(const std::string&) override {}
  DispatchQueue& main() override { std::abort(); }
  std::shared_ptr<DispatchQueue> makeSerialQueue(const std::string&) override { return nullptr; }
  std::shared_ptr<OperationQueue> makeOperationQueue(const std::string& name, QualityOfService quality) override;
  std::unique_ptr<TimerSource> makeTimer(std::shared_ptr<DispatchQueue>, std::chrono::nanoseconds, std::chrono::nanoseconds,
                                         Block) override {
    return nullptr;
  }
  Date now() override { return now_; }

  // ScreenFactory
  Graphics& graphics() override { std::abort(); }
  vaelo::Device& device() override { std::abort(); }
  WindowRef makeWindow(const Rect&) override { return nullptr; }
  DocumentListControllerRef makeRootList() override { return nullptr; }
  DocumentListControllerRef makeList(const URL&) override { return nullptr; }
  std::optional<std::vector<DocumentListControllerRef>> hierarchyTo(const URL&) override { return std::nullopt; }
  ViewControllerRef makeDriveUnavailable() override { return nullptr; }
  bool canPreviewItem(const URL& url) override;
  std::shared_ptr<DocumentInteractionController> makeDocumentInteraction(const URL& url) override;
  std::shared_ptr<UpgradeFlowManager> makeUpgradeFlow(StorageOfferRef) override { return nullptr; }
  void runPreOpenAlert(const URL& url, const ViewControllerRef& presenter, std::function<void()> open) override;

 private:
  Result<ResourceMap> valuesOf(const URL& url, const std::vector<ResourceKey>& keys, bool promised);

  NotificationCenter notifications_;
  MemoryFileProgress fileProgress;
  MemoryUserActivities userActivities;
  Platform platform_;
};

/// The base of all tests of items.
class ItemsTest : public ::testing::Test {
 protected:
  bool logged(const std::string& level, const std::string& message) { return world.recordedLog.has(level, message); }
  /// The whole lines' messages, level first, as in "INFO Deleted item: ...".
  std::vector<std::string> messages();

  ItemsWorld world;
};

}  // namespace vaelo
