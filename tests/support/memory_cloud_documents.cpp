// SPDX-License-Identifier: GPL-3.0-or-later
#include "tests/support/memory_cloud_documents.h"

#include <algorithm>

#include "tests/support/memory_error.h"

namespace vaelo {

namespace {

constexpr int NoAccount = 8;

}  // namespace

MemoryCloudDocuments::MemoryCloudDocuments(MemoryDisk& disk, Queues& queues, NotificationCenter& notifications,
                                           CallRecord& record)
    : drive(std::make_shared<MemoryContainer>(DriveIdentifier, "Vaelo Drive", Drive)),
      containers{drive},
      disk_(disk),
      queues_(queues),
      notifications_(notifications),
      record_(record) {
  drive->disk = &disk;
  disk_.addFolder(Drive.path());
}

std::shared_ptr<MemoryContainer> MemoryCloudDocuments::addContainer(const std::string& identifier, const std::string& name) {
  auto container = std::make_shared<MemoryContainer>(
      identifier, name, Mirror.appendingPathComponent(identifier, true).appendingPathComponent("Documents", true));
  container->disk = &disk_;
  containers.push_back(container);
  disk_.addFolder(container->folder->path());
  return container;
}

void MemoryCloudDocuments::setAccount(std::optional<UbiquityIdentityToken> token) {
  if (token == account) return;
  account = std::move(token);
  queues_.main().async([this] { notifications_.post({IdentityDidChangeNotification, {}}); });
}

std::vector<CloudContainerRef> MemoryCloudDocuments::allContainers() {
  if (!account) return {};
  std::vector<CloudContainerRef> shown;
  std::copy_if(containers.begin(), containers.end(), std::back_inserter(shown),
               [](const CloudContainerRef& container) { return container->documentsFolderURL().has_value(); });
  const auto order = [](const CloudContainerRef& a, const CloudContainerRef& b) {
    const bool aIsOther = a->identifier() != DriveIdentifier, bIsOther = b->identifier() != DriveIdentifier;
    return std::pair(aIsOther, a->localizedName()) < std::pair(bIsOther, b->localizedName());
  };
  std::stable_sort(shown.begin(), shown.end(), order);
  return shown;
}

CloudContainerRef MemoryCloudDocuments::containerWithIdentifier(const std::string& identifier) {
  for (const CloudContainerRef& container : containers) {
    if (container->identifier() == identifier) return container;
  }
  return nullptr;
}

Result<CloudContainerRef> MemoryCloudDocuments::containerForURL(const URL& url) {
  Result<CloudContainerRef> result;
  if (containerLookupTellsNothing) return result;
  if (containerError) result.error = containerError;
  if (containerError && !containerErrorComesWithValue) return result;
  const std::optional<std::string> identifier = containerIdentifierForURL(url);
  CloudContainerRef container = identifier ? containerWithIdentifier(*identifier) : nullptr;
  if (containerOfEverything) container = containerOfEverything;
  if (container) {
    result.value = container;
  } else {
    result.error = memoryError(NotInDrive, url.path(), "It is in no container");
    result.error->domain = CloudDocumentsErrorDomain;
  }
  return result;
}

std::optional<std::string> MemoryCloudDocuments::containerIdentifierForURL(const URL& url) {
  const std::optional<std::string> relative = pathRelativeToMirror(url);
  if (!relative || relative->empty() || relative->front() == '.') return std::nullopt;
  const std::string identifier = relative->substr(0, relative->find('/'));
  return containerWithIdentifier(identifier) ? std::optional(identifier) : std::nullopt;
}

bool MemoryCloudDocuments::isDocumentsContainer(const URL& url) {
  const URL real = realPathURL(url);
  return std::any_of(containers.begin(), containers.end(),
                     [&](const CloudContainerRef& container) { return container->documentsFolderURL() == real; });
}

std::optional<std::string> MemoryCloudDocuments::pathRelativeToMirror(const URL& url) {
  const URL real = realPathURL(url);
  if (!real.isInside(Mirror)) return std::nullopt;
  return real == Mirror ? std::string() : real.path().substr(Mirror.path().size() + 1);
}

bool MemoryCloudDocuments::URLIsInDriveTrash(const URL& url) {
  return realPathURL(url).isInside(Mirror.appendingPathComponent(".Trash"));
}

URL MemoryCloudDocuments::realPathURL(const URL& url) {
  const std::string real = disk_.realPath(url.path());
  return real == url.path() ? url : URL(real, url.hasDirectoryPath());
}

bool MemoryCloudDocuments::isExternalDocumentReference(const URL& url) {
  if (bookmarks.contains(url.path())) return true;
  const MemoryItem* item = disk_.physicalItem(url.path());
  return !url.pathExtension().empty() && url.lastPathComponent().ends_with(".vaelobookmark") && item &&
         item->type() == FileType::Regular;
}

Result<URL> MemoryCloudDocuments::resolveExternalDocumentReference(const URL& url) {
  if (const auto chosen = bookmarks.find(url.path()); chosen != bookmarks.end()) return chosen->second;
  const MemoryItem* item = disk_.physicalItem(url.path());
  if (!url.lastPathComponent().ends_with(".vaelobookmark")) {
    return memoryError(FileErrorCode::ReadUnknown, url.path(), "It is no bookmark");
  }
  if (!item) return noSuchItem(url.path(), FileErrorCode::ReadNoSuchFile);
  if (!item->bookmarkTarget) return memoryError(FileErrorCode::ReadUnknown, url.path(), "It is no bookmark");
  const std::string target = item->bookmarkTarget->path();
  if (!disk_.logicalItem(target) && !disk_.physicalItem(target)) return noSuchItem(target);
  return *item->bookmarkTarget;
}

bool MemoryCloudDocuments::isPromise(const URL& url) {
  return logicalOfPromise.contains(url.path()) || MemoryDisk::isPromiseName(url.lastPathComponent());
}

URL MemoryCloudDocuments::logicalURLOfPromise(const URL& url) {
  if (const auto chosen = logicalOfPromise.find(url.path()); chosen != logicalOfPromise.end()) return chosen->second;
  const std::string logical = disk_.logicalPath(url.path());
  return logical == url.path() ? url : URL(logical);
}

URL MemoryCloudDocuments::physicalURL(const URL& url) {
  if (const auto chosen = physicalOfLogical.find(url.path()); chosen != physicalOfLogical.end()) return chosen->second;
  const MemoryItem* item = disk_.logicalItem(url.path());
  return item && item->isPromise ? URL(MemoryDisk::promisePath(url.path())) : url;
}

Result<std::vector<std::string>> MemoryCloudDocuments::tagNames(const URL& url) {
  if (const auto chosen = tags.find(url.path()); chosen != tags.end()) return chosen->second;
  const MemoryItem* item = disk_.logicalItem(url.path());
  if (!item) item = disk_.physicalItem(url.path());
  if (!item) return noSuchItem(url.path());
  return item->tags;
}

bool MemoryCloudDocuments::canMoveWithoutDownloading(const CloudContainer& from, const CloudContainer& to) {
  record_.calls.push_back("canMove " + from.identifier() + " " + to.identifier());
  if (movesAreFree) return from.identifier() != to.identifier();
  return movableTo.contains(to.identifier()) || movable.contains({from.identifier(), to.identifier()});
}

std::optional<Error> MemoryCloudDocuments::evict(const URL& url) {
  record_.calls.push_back("evict " + url.path());
  return evictError;
}

void MemoryCloudDocuments::fetchQuota(std::function<void(Result<std::int64_t>)> done) {
  ++quotaFetches;
  if (account) return done(quota);
  Error error = memoryError(NoAccount, "", "Nobody is signed in");
  error.domain = CloudDocumentsErrorDomain;
  done(error);
}

}  // namespace vaelo
