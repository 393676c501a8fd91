// SPDX-License-Identifier: GPL-3.0-or-later
#include "tests/support/memory_drive.h"

#include <algorithm>

namespace vaelo {

namespace {

Error noSuchFile() { return {FileErrorDomain, FileErrorCode::NoSuchFile, {}, "No such file", {}}; }

/// Runs accessors at once, or not at all when the drive has an error for them.
class MemoryCoordinator : public FileCoordinator {
 public:
  explicit MemoryCoordinator(MemoryDrive& drive) : drive_(drive) {}
  std::optional<Error> coordinateReading(const URL& url, unsigned options, const Accessor& accessor) override {
    return run("read " + url.path() + " " + std::to_string(options), [&] { accessor(url); });
  }
  std::optional<Error> coordinateWriting(const URL& url, unsigned options, const Accessor& accessor) override {
    return run("write " + url.path() + " " + std::to_string(options), [&] { accessor(url); });
  }
  std::optional<Error> coordinateWriting(const URL& first, unsigned firstOptions, const URL& second, unsigned secondOptions,
                                         const PairAccessor& accessor) override {
    return run("write " + first.path() + " " + std::to_string(firstOptions) + " " + second.path() + " " +
                   std::to_string(secondOptions),
               [&] { accessor(first, second); });
  }
  void itemWillMove(const URL& from, const URL& to) override {
    drive_.calls.push_back("will move " + from.path() + " " + to.path());
  }
  void itemDidMove(const URL& from, const URL& to) override {
    drive_.calls.push_back("did move " + from.path() + " " + to.path());
  }

 private:
  std::optional<Error> run(const std::string& call, const std::function<void()>& access) {
    drive_.calls.push_back(call);
    if (drive_.beforeAccessor) drive_.beforeAccessor();
    if (drive_.coordinationError) return drive_.coordinationError;
    access();
    return std::nullopt;
  }
  MemoryDrive& drive_;
};

}  // namespace

MemoryDrive::MemoryDrive() { addContainer(defaultID, "Vaelo Drive")->folder = URL("/drive/mirror/" + defaultID, true); }

MemoryDrive::Item& MemoryDrive::add(const std::string& path, FileType type) {
  const URL url(path);
  const URL parent = url.deletingLastPathComponent();
  if (parent.path() != "/" && !items.contains(parent.path())) add(parent.path(), FileType::Directory);
  Item& item = items[path];
  const Date date(std::chrono::seconds(1000));
  item.attributes.type = type;
  item.attributes.modificationDate = item.attributes.creationDate = date;
  item.values = {{ResourceKey::Name, url.lastPathComponent()},
                 {ResourceKey::LocalizedName, url.lastPathComponent()},
                 {ResourceKey::ContentModificationDate, date},
                 {ResourceKey::CreationDate, date},
                 {ResourceKey::ParentDirectoryURL, parent},
                 {ResourceKey::IsDirectory, type == FileType::Directory},
                 {ResourceKey::TypeIdentifier, type == FileType::Directory      ? "public.folder"
                                               : type == FileType::SymbolicLink ? "public.symlink"
                                                                                : "public.data"}};
  return item;
}

std::shared_ptr<MemoryContainer> MemoryDrive::addContainer(const std::string& id, const std::string& name) {
  auto container = std::make_shared<MemoryContainer>();
  container->id = id;
  container->name = name;
  container->folder = URL("/drive/mirror/" + id + "/Documents", true);
  containers.push_back(container);
  add(container->folder->path(), FileType::Directory);
  return container;
}

MemoryDrive::Item* MemoryDrive::itemAt(const std::string& path) {
  const auto found = items.find(path);
  return found == items.end() ? nullptr : &found->second;
}

ResourceMap MemoryDrive::picked(const ResourceMap& values, const std::vector<ResourceKey>& keys) {
  ResourceMap result;
  for (const ResourceKey key : keys) {
    const auto found = values.find(key);
    if (found != values.end()) result.insert(*found);
  }
  return result;
}

CloudContainerRef MemoryDrive::containerWithIdentifier(const std::string& identifier) {
  for (const auto& container : containers) {
    if (container->id == identifier) return container;
  }
  return nullptr;
}

std::optional<std::string> MemoryDrive::containerIdentifierForURL(const URL& url) {
  for (const auto& container : containers) {
    if (url.isInside(URL("/drive/mirror/" + container->id))) return container->id;
  }
  return std::nullopt;
}

Result<CloudContainerRef> MemoryDrive::containerForURL(const URL& url) {
  if (containerLookupError) return *containerLookupError;
  const std::optional<std::string> id = containerIdentifierForURL(url);
  if (!id) return noSuchFile();
  return containerWithIdentifier(*id);
}

bool MemoryDrive::isDocumentsContainer(const URL& url) {
  return std::any_of(containers.begin(), containers.end(), [&](const auto& container) { return container->folder == url; });
}

std::optional<std::string> MemoryDrive::pathRelativeToMirror(const URL& url) {
  const URL mirror("/drive/mirror");
  if (!url.isInside(mirror) || url == mirror) return std::nullopt;
  return url.path().substr(mirror.path().size() + 1);
}

bool MemoryDrive::isExternalDocumentReference(const URL& url) { return url.pathExtension() == "vaelobookmark"; }

Result<URL> MemoryDrive::resolveExternalDocumentReference(const URL& url) {
  const Item* item = itemAt(url.path());
  if (!item || !item->bookmarkTarget) return noSuchFile();
  return *item->bookmarkTarget;
}

URL MemoryDrive::physicalURL(const URL& url) {
  const Item* item = itemAt(url.path());
  return item && item->promised ? URL(url.path() + ".physical") : url;
}

Result<std::vector<std::string>> MemoryDrive::tagNames(const URL& url) {
  const Item* item = itemAt(url.path());
  if (!item) return noSuchFile();
  return item->tags;
}

bool MemoryDrive::canMoveWithoutDownloading(const CloudContainer& from, const CloudContainer& to) {
  return movable.contains({from.identifier(), to.identifier()});
}

Result<ResourceMap> MemoryDrive::promisedItemResourceValues(const URL& url, const std::vector<ResourceKey>& keys) {
  if (promisedReadError) return *promisedReadError;
  const Item* item = itemAt(url.path());
  if (!item) return noSuchFile();
  return picked(item->values, keys);
}

Result<ResourceMap> MemoryDrive::resourceValues(const URL& url, const std::vector<ResourceKey>& keys) {
  calls.push_back("plain values " + url.path());
  if (plainReadError) return *plainReadError;
  const Item* item = itemAt(url.path());
  if (!item || item->promised) return noSuchFile();
  return picked(item->values, keys);
}

URL MemoryDrive::resolvingSymlinks(const URL& url) {
  const Item* item = itemAt(url.path());
  return item && !item->linkTarget.empty() ? URL(item->linkTarget) : url;
}

Result<URL> MemoryDrive::resolveAliasFile(const URL& url) {
  calls.push_back("alias " + url.path());
  const Item* item = itemAt(url.path());
  if (!item || !item->aliasTarget) return noSuchFile();
  return *item->aliasTarget;
}

bool MemoryDrive::startAccessingSecurityScopedResource(const URL&) {
  if (secured) ++openScopes;
  return secured;
}

bool MemoryDrive::fileExistsAtPath(const std::string& path, bool* isDirectory) {
  const Item* item = itemAt(path);
  if (!item || item->promised) return false;
  if (isDirectory) *isDirectory = item->attributes.type == FileType::Directory;
  return true;
}

Result<FileAttributes> MemoryDrive::attributesOfItemAtPath(const std::string& path) {
  const Item* item = itemAt(path);
  if (!item || item->promised) return noSuchFile();
  return item->attributes;
}

Result<std::string> MemoryDrive::destinationOfSymbolicLinkAtPath(const std::string& path) {
  const Item* item = itemAt(path);
  if (!item || item->linkTarget.empty()) return noSuchFile();
  return item->linkTarget;
}

std::optional<Error> MemoryDrive::createDirectoryAtURL(const URL& url) {
  if (!changeError) add(url.path(), FileType::Directory);
  return changeError;
}

std::optional<Error> MemoryDrive::removeItemAtURL(const URL& url) {
  if (!changeError) std::erase_if(items, [&](const auto& entry) { return URL(entry.first).isInside(url); });
  return changeError;
}

std::optional<Error> MemoryDrive::moveItemAtURL(const URL& source, const URL& destination) {
  if (changeError) return changeError;
  auto moved = items.extract(source.path());
  if (moved.empty()) return noSuchFile();
  moved.key() = destination.path();
  items.insert(std::move(moved));
  return std::nullopt;
}

void MemoryDrive::enumerate(const URL& url, const std::vector<ResourceKey>&, unsigned,
                            const std::function<bool(const URL&)>& visit,
                            const std::function<bool(const URL&, const Error&)>& onError) {
  if (!items.contains(url.path())) onError(url, noSuchFile());
  for (const auto& [path, item] : items) {
    const URL entry(path);
    if (entry.isInside(url) && !(entry == url) && !visit(entry)) return;
  }
}

std::unique_ptr<FileCoordinator> MemoryDrive::makeCoordinator(FilePresenter*) {
  return std::make_unique<MemoryCoordinator>(*this);
}

}  // namespace vaelo
