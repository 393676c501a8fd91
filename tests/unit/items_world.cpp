// SPDX-License-Identifier: GPL-3.0-or-later
#include "tests/unit/items_world.h"

#include <algorithm>
#include <cctype>

namespace vaelo {

namespace {

class WorldCoordinator : public FileCoordinator {
 public:
  explicit WorldCoordinator(ItemsWorld& world) : world_(world) {}

  std::optional<Error> coordinateReading(const URL& url, unsigned options, const Accessor& accessor) override {
    world_.lastOptions = options;
    world_.calls.push_back("read " + url.path());
    return run([&] { accessor(given(url)); });
  }
  std::optional<Error> coordinateWriting(const URL& url, unsigned options, const Accessor& accessor) override {
    world_.calls.push_back("write " + std::to_string(options) + " " + url.path());
    return run([&] { accessor(given(url)); });
  }
  std::optional<Error> coordinateWriting(const URL& first, unsigned firstOptions, const URL& second, unsigned secondOptions,
                                         const PairAccessor& accessor) override {
    world_.calls.push_back("write " + std::to_string(firstOptions) + " " + first.path() + " " +
                           std::to_string(secondOptions) + " " + second.path());
    return run([&] { accessor(given(first), given(second)); });
  }
  void itemWillMove(const URL& from, const URL& to) override {
    world_.calls.push_back("willMove " + from.path() + " " + to.path());
  }
  void itemDidMove(const URL& from, const URL& to) override {
    world_.calls.push_back("didMove " + from.path() + " " + to.path());
  }

 private:
  std::optional<Error> run(const Block& access) {
    if (!world_.coordinatorError || world_.errorAfterAccessor) {
      if (world_.beforeAccessor) world_.beforeAccessor();
      access();
    }
    return world_.coordinatorError;
  }
  URL given(const URL& url) const {
    const auto found = world_.redirected.find(url.path());
    return found == world_.redirected.end() ? url : found->second;
  }

  ItemsWorld& world_;
};

class WorldRecord : public DocumentRecord {
 public:
  WorldRecord(URL url, Result<Ranked> ranked) : url_(std::move(url)), ranked_(std::move(ranked)) {}
  URL url() const override { return url_; }
  Result<Ranked> applicationsAvailableForOpeningByHandlerRank() override { return ranked_; }

 private:
  URL url_;
  Result<Ranked> ranked_;
};

class WorldInteraction : public DocumentInteractionController {
 public:
  WorldInteraction(ItemsWorld& world, URL url) : world_(world), url_(std::move(url)) {}
  URL url() const override { return url_; }
  std::string name() const override { return {}; }
  void setName(std::string) override {}
  void setDelegate(std::weak_ptr<DocumentInteractionControllerDelegate>) override {}
  bool presentOptionsMenuFromRect(const Rect&, const ViewRef&, bool) override { return false; }
  bool presentOptionsMenuFromBarButtonItem(const BarButtonItemRef&, bool) override { return false; }
  bool openInPlaceWith(const ApplicationRecord& application) override {
    world_.calls.push_back("open " + url_.path() + " with " + application.bundleIdentifier);
    return world_.opensInPlace;
  }

 private:
  ItemsWorld& world_;
  URL url_;
};

class WorldQueue : public OperationQueue {
 public:
  WorldQueue(std::string name, QualityOfService quality) : name_(std::move(name)), quality_(quality) {}
  void addOperation(Block) override {}
  std::string name() const override { return name_; }
  QualityOfService qualityOfService() const override { return quality_; }

 private:
  std::string name_;
  QualityOfService quality_;
};

template <typename Map>
auto found(const Map& map, const std::string& key) -> std::optional<typename Map::mapped_type> {
  const auto at = map.find(key);
  if (at == map.end()) return std::nullopt;
  return at->second;
}

Error noSuchFile() { return fileError(FileErrorCode::NoSuchFile); }

}  // namespace

ItemsWorld::ItemsWorld()
    : drive(std::make_shared<TestContainer>(DriveIdentifier, "Vaelo Drive", Drive)),
      library(std::make_shared<TestContainer>(LibraryIdentifier, "Sketchbook", LibraryDocuments)),
      containers{drive, library},
      platform_{*this, *this,       *this,          *this, *this, *this, *this, fileProgress, *this, *this,
                *this, recordedLog, notifications_, *this, *this, *this, *this, *this,        *this, userActivities} {
  Platform::install(&platform_);
}

ItemsWorld::~ItemsWorld() { Platform::install(nullptr); }

WorldItem& ItemsWorld::addFile(const URL& url, ResourceMap values) {
  WorldItem& item = items[url.path()];
  item.values = std::move(values);
  item.attributes.type = FileType::Regular;
  return item;
}

WorldItem& ItemsWorld::addFolder(const URL& url, ResourceMap values) {
  WorldItem& item = addFile(url, std::move(values));
  item.type = FileType::Directory;
  item.attributes.type = FileType::Directory;
  return item;
}

int ItemsWorld::indexOf(const std::string& call) const {
  const auto at = std::find(calls.begin(), calls.end(), call);
  return at == calls.end() ? -1 : static_cast<int>(at - calls.begin());
}

CloudContainerRef ItemsWorld::containerWithIdentifier(const std::string& identifier) {
  for (const CloudContainerRef& container : containers) {
    if (container->identifier() == identifier) return container;
  }
  return nullptr;
}

Result<CloudContainerRef> ItemsWorld::containerForURL(const URL& url) {
  const std::optional<std::string> identifier = containerIdentifierForURL(url);
  Result<CloudContainerRef> result;
  if (containerError) result.error = containerError;
  if (!containerError || containerErrorComesWithValue) {
    const CloudContainerRef container = identifier ? containerWithIdentifier(*identifier) : nullptr;
    if (container) result.value = container;
    if (!container) result.error = noSuchFile();
  }
  return result;
}

std::optional<std::string> ItemsWorld::containerIdentifierForURL(const URL& url) {
  if (url.isInside(Drive)) return DriveIdentifier;
  if (url.isInside(Library)) return LibraryIdentifier;
  return std::nullopt;
}

bool ItemsWorld::isDocumentsContainer(const URL& url) { return url == Drive || url == LibraryDocuments; }

std::optional<std::string> ItemsWorld::pathRelativeToMirror(const URL& url) {
  if (!url.isInside(Mirror)) return std::nullopt;
  return url == Mirror ? std::string() : url.path().substr(Mirror.path().size() + 1);
}

Result<URL> ItemsWorld::resolveExternalDocumentReference(const URL& url) {
  return found(bookmarks, url.path()).value_or(noSuchFile());
}

URL ItemsWorld::logicalURLOfPromise(const URL& url) { return found(logicalOfPromise, url.path()).value_or(url); }

URL ItemsWorld::physicalURL(const URL& url) { return found(physicalOfLogical, url.path()).value_or(url); }

Result<std::vector<std::string>> ItemsWorld::tagNames(const URL& url) {
  return found(tags, url.path()).value_or(std::vector<std::string>{});
}

bool ItemsWorld::canMoveWithoutDownloading(const CloudContainer& from, const CloudContainer& to) {
  calls.push_back("canMove " + from.identifier() + " " + to.identifier());
  return movableTo.contains(to.identifier());
}

std::optional<Error> ItemsWorld::evict(const URL& url) {
  calls.push_back("evict " + url.path());
  return evictError;
}

bool ItemsWorld::containsIllegalCharacter(const std::string& text) { return text.find('\\') != std::string::npos; }

bool ItemsWorld::containsControlCharacter(const std::string& text) { return text.find('\t') != std::string::npos; }

bool ItemsWorld::containsNewline(const std::string& text) { return text.find('\n') != std::string::npos; }

bool ItemsWorld::localizedCaseInsensitiveEquals(const std::string& a, const std::string& b) {
  return std::equal(a.begin(), a.end(), b.begin(), b.end(),
                    [](unsigned char x, unsigned char y) { return std::tolower(x) == std::tolower(y); });
}

std::optional<DocumentStore::Device> ItemsWorld::deviceOf(const URL& folder) {
  calls.push_back("deviceOf " + folder.path());
  return device_;
}

SystemResult<DocumentStore::FileID> ItemsWorld::resolveDocumentID(Device device, std::uint64_t documentID) {
  devices.insert(device);
  calls.push_back("resolve " + std::to_string(documentID));
  return resolvedFile;
}

SystemResult<int> ItemsWorld::openByID(Device device, FileID file) {
  devices.insert(device);
  calls.push_back("openByID " + std::to_string(file));
  return openedHandle;
}

SystemResult<DocumentStore::OpenFileAttributes> ItemsWorld::attributesOfOpenFile(int handle) {
  calls.push_back("attributes " + std::to_string(handle));
  return openAttributes;
}

void ItemsWorld::close(int handle) { calls.push_back("close " + std::to_string(handle)); }

std::unique_ptr<FileCoordinator> ItemsWorld::makeCoordinator(FilePresenter* presenter) {
  calls.push_back(presenter ? "coordinator of a presenter" : "coordinator");
  return std::make_unique<WorldCoordinator>(*this);
}

bool ItemsWorld::fileExistsAtPath(const std::string& path, bool* isDirectory) {
  const auto at = items.find(path);
  const bool exists = at != items.end() && !at->second.isPromise;
  if (isDirectory) *isDirectory = exists && at->second.type == FileType::Directory;
  return exists;
}

Result<FileAttributes> ItemsWorld::attributesOfItemAtPath(const std::string& path) {
  const auto at = items.find(path);
  if (at == items.end()) return noSuchFile();
  return at->second.attributes;
}

Result<std::string> ItemsWorld::destinationOfSymbolicLinkAtPath(const std::string& path) {
  const auto at = items.find(path);
  if (at == items.end() || at->second.linkTarget.empty()) return noSuchFile();
  return at->second.linkTarget;
}

std::optional<Error> ItemsWorld::createDirectoryAtURL(const URL& url) {
  calls.push_back("create " + url.path());
  return createError;
}

std::optional<Error> ItemsWorld::removeItemAtURL(const URL& url) {
  calls.push_back("remove " + url.path());
  return removeError;
}

std::optional<Error> ItemsWorld::moveItemAtURL(const URL& source, const URL& destination) {
  calls.push_back("move " + source.path() + " " + destination.path());
  return moveError;
}

void ItemsWorld::enumerate(const URL& url, const std::vector<ResourceKey>& prefetch, unsigned options,
                           const std::function<bool(const URL&)>& visit,
                           const std::function<bool(const URL&, const Error&)>& onError) {
  calls.push_back("enumerate " + url.path());
  lastKeys = prefetch;
  lastOptions = options;
  // What can't be read comes first, so that a walk that ends there finds nothing.
  if (enumerationError && !onError(url.appendingPathComponent("locked"), *enumerationError)) return;
  for (const auto& [path, item] : items) {
    if (!(URL(path) == url) && URL(path).isInside(url) && !visit(URL(path))) return;
  }
}

std::string ItemsWorld::expandingTilde(const std::string& path) {
  return path.starts_with("~") ? "/home/somebody" + path.substr(1) : path;
}

Result<ResourceMap> ItemsWorld::valuesOf(const URL& url, const std::vector<ResourceKey>& keys, bool promised) {
  calls.push_back((promised ? "promised " : "plain ") + url.path());
  lastKeys = keys;
  if (const auto answer = found(promised ? promisedAnswers : plainAnswers, url.path())) return *answer;
  const auto at = items.find(url.path());
  if (at == items.end() || (at->second.isPromise && !promised)) return noSuchFile();
  ResourceMap values;
  for (const ResourceKey key : keys) {
    const auto value = at->second.values.find(key);
    if (value != at->second.values.end()) values.insert(*value);
  }
  return values;
}

Result<ResourceMap> ItemsWorld::promisedItemResourceValues(const URL& url, const std::vector<ResourceKey>& keys) {
  return valuesOf(url, keys, true);
}

Result<ResourceMap> ItemsWorld::resourceValues(const URL& url, const std::vector<ResourceKey>& keys) {
  return valuesOf(url, keys, false);
}

bool ItemsWorld::promisedItemIsReachable(const URL& url) {
  return items.contains(url.path()) && !unreachable.contains(url.path());
}

URL ItemsWorld::resolvingSymlinks(const URL& url) { return found(linkTargets, url.path()).value_or(url); }

Result<URL> ItemsWorld::resolveAliasFile(const URL& url) {
  calls.push_back("resolveAlias " + url.path());
  return found(aliasTargets, url.path()).value_or(noSuchFile());
}

bool ItemsWorld::startAccessingSecurityScopedResource(const URL& url) {
  calls.push_back("start " + url.path());
  return securityScoped;
}

void ItemsWorld::stopAccessingSecurityScopedResource(const URL& url) { calls.push_back("stop " + url.path()); }

std::string ItemsWorld::byteCount(std::uint64_t bytes, ByteCountStyle style, bool withUnit) {
  return std::to_string(bytes) + (style == ByteCountStyle::File ? " file" : " binary") + (withUnit ? " bytes" : "");
}

std::string ItemsWorld::localizedDate(Date date, DateStyle dateStyle, DateStyle timeStyle) {
  const auto seconds = std::chrono::duration_cast<std::chrono::seconds>(date.time_since_epoch()).count();
  return std::to_string(seconds) + " s, date " + std::to_string(static_cast<int>(dateStyle)) + ", time " +
         std::to_string(static_cast<int>(timeStyle));
}

std::optional<std::string> ItemsWorld::preferredIdentifierForExtension(const std::string& extension) {
  return found(typeOfExtension, extension);
}

bool ItemsWorld::conformsTo(const std::string& type, const std::string& other) {
  const auto kinds = found(conformances, type);
  return type == other || (kinds && kinds->contains(other));
}

std::optional<std::string> ItemsWorld::description(const std::string& type) { return found(descriptions, type); }

std::shared_ptr<DocumentRecord> ItemsWorld::documentRecord(const URL& url, bool sourceIsManaged) {
  calls.push_back((sourceIsManaged ? "managed record " : "record ") + url.path());
  return std::make_shared<WorldRecord>(url, ranked);
}

std::optional<ApplicationRecord> ItemsWorld::applicationRecord(const std::string& bundleIdentifier) {
  return found(applications, bundleIdentifier);
}

std::shared_ptr<OperationQueue> ItemsWorld::makeOperationQueue(const std::string& name, QualityOfService quality) {
  return std::make_shared<WorldQueue>(name, quality);
}

bool ItemsWorld::canPreviewItem(const URL& url) {
  calls.push_back("canPreview " + url.path());
  return !unpreviewable.contains(url.path());
}

std::shared_ptr<DocumentInteractionController> ItemsWorld::makeDocumentInteraction(const URL& url) {
  return std::make_shared<WorldInteraction>(*this, url);
}

void ItemsWorld::runPreOpenAlert(const URL& url, const ViewControllerRef& presenter, std::function<void()> open) {
  calls.push_back("preOpenAlert " + url.path());
  openingPresenter = presenter;
  if (holdsOpening) {
    heldOpening = std::move(open);
  } else {
    open();
  }
}

std::vector<std::string> ItemsTest::messages() {
  std::vector<std::string> result;
  for (const std::string& line : world.recordedLog.lines()) {
    // "(VLO)[LEVEL] function (line) message"
    const std::size_t open = line.find('[');
    const std::size_t close = line.find(']');
    const std::size_t end = line.find(") ", close);
    if (close == std::string::npos || end == std::string::npos) {
      result.push_back(line);
    } else {
      result.push_back(line.substr(open + 1, close - open - 1) + " " + line.substr(end + 2));
    }
  }
  return result;
}

}  // namespace vaelo
