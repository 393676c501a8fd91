// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/drive/local_cloud_documents.h"

#include <sys/stat.h>
#include <sys/statvfs.h>

#include <algorithm>
#include <cerrno>

#include "host/drive/bookmark_file.h"
#include "host/drive/item_attributes.h"
#include "host/drive/local_accounts.h"
#include "host/drive/mirror_walk.h"
#include "host/drive/promise_file.h"
#include "host/drive/small_file.h"

namespace vaelo {

namespace {

std::optional<Error> setUp(LocalAccounts accounts, LogSink& log, bool& wasDamaged) {
  wasDamaged = accounts.setDamagedFileAside();
  std::optional<Error> error = accounts.makeFirstIfAbsent();
  if (error) log.write(LogType::Error, "drive: can't make the local account: " + error->description());
  return error;
}

bool isRegularFile(const std::string& path) {
  struct stat status = {};
  return ::lstat(path.c_str(), &status) == 0 && S_ISREG(status.st_mode);
}

// Spares all other items the look at their container.
bool isDocumentsFolderName(std::string_view relativeToMirror) {
  if (relativeToMirror == DriveLayout::DefaultContainer) return true;
  return relativeToMirror.ends_with("/Documents") && std::count(relativeToMirror.begin(), relativeToMirror.end(), '/') == 1;
}

// A promise counts as much as the item that it stands for: the account holds that.
std::int64_t usedBytes(const std::string& mirror) {
  std::int64_t used = 0;
  walkTree(mirror, [&used](const std::string& path, const struct stat& status) {
    if (!S_ISREG(status.st_mode)) return true;
    auto size = static_cast<std::uint64_t>(std::max<off_t>(status.st_size, 0));
    if (isPromiseName(path.substr(path.rfind('/') + 1))) {
      if (const Result<PromiseInfo> promise = readPromise(path)) size = promise.value->size;
    }
    if (__builtin_add_overflow(used, size, &used)) used = INT64_MAX;
    return true;
  });
  return used;
}

}  // namespace

Error cloudError(int code, const std::string& path, const std::string& reason) {
  Error error = fileError(code, path, reason);
  error.domain = CloudDocumentsErrorDomain;
  return error;
}

LocalCloudDocuments::LocalCloudDocuments(const std::string& dataFolder, LogSink& log, Queues& queues,
                                         NotificationCenter& notifications)
    : layout_(dataFolder),
      setUpFailure_(setUp(LocalAccounts(layout_, log), log, accountWasDamaged_)),
      account_(layout_, log, queues, notifications),
      removals_(layout_.mirrorRoot() + DriveLayout::Removing, log, queues),
      containers_(layout_, log, removals_),
      index_(layout_, log,
             [&queues, &notifications] {
               queues.main().async([&notifications] { notifications.post({DocumentIndexRebuiltNotification, {}}); });
             }),
      workers_(queues.makeOperationQueue("com.marrow.VaeloDrive.cloud-documents", QualityOfService::Utility)) {
  workers_->addOperation([this] { index_.open(); });
}

std::optional<UbiquityIdentityToken> LocalCloudDocuments::ubiquityIdentityToken() { return account_.token(); }

std::string LocalCloudDocuments::defaultContainerIdentifier() { return DriveLayout::DefaultContainer; }

std::vector<CloudContainerRef> LocalCloudDocuments::allContainers() {
  return account_.token() ? containers_.all() : std::vector<CloudContainerRef>();
}

CloudContainerRef LocalCloudDocuments::containerWithIdentifier(const std::string& identifier) {
  return containers_.container(identifier);
}

Result<CloudContainerRef> LocalCloudDocuments::containerForURL(const URL& url) {
  const std::optional<std::string> identifier = layout_.containerOf(url.path());
  CloudContainerRef container = identifier ? containers_.container(*identifier) : nullptr;
  if (container) return container;
  return cloudError(CloudDocumentsErrorCode::NotInDrive, url.path(), "the item is in no container of the drive");
}

std::optional<std::string> LocalCloudDocuments::containerIdentifierForURL(const URL& url) {
  const Result<CloudContainerRef> container = containerForURL(url);
  if (!container) return std::nullopt;
  return (*container.value)->identifier();
}

bool LocalCloudDocuments::isDocumentsContainer(const URL& url) {
  const std::optional<std::string> relative = layout_.relativeToMirror(url.path());
  if (!relative || !isDocumentsFolderName(*relative)) return false;
  const CloudContainerRef container = containers_.container(relative->substr(0, relative->find('/')));
  return container && container->documentsFolderURL() &&
         container->documentsFolderURL()->path() == layout_.mirrorRoot() + "/" + *relative;
}

std::optional<URL> LocalCloudDocuments::defaultContainerURL() {
  if (!account_.token()) return std::nullopt;
  return URL(layout_.defaultContainerFolder(), true);
}

std::optional<std::string> LocalCloudDocuments::pathRelativeToMirror(const URL& url) {
  return layout_.relativeToMirror(url.path());
}

bool LocalCloudDocuments::URLIsInDriveMirror(const URL& url) { return layout_.isInMirror(url.path()); }

bool LocalCloudDocuments::URLIsInDriveTrash(const URL& url) { return layout_.isInTrash(url.path()); }

URL LocalCloudDocuments::realPathURL(const URL& url) {
  const std::string place = realLocation(url.path());
  return place == url.path() ? url : URL(place, url.hasDirectoryPath());
}

bool LocalCloudDocuments::isExternalDocumentReference(const URL& url) {
  return isBookmarkName(url.lastPathComponent()) && isRegularFile(url.path());
}

Result<URL> LocalCloudDocuments::resolveExternalDocumentReference(const URL& url) {
  if (!isBookmarkName(url.lastPathComponent())) {
    return fileError(FileErrorCode::ReadUnknown, url.path(), "the item is no bookmark");
  }
  Result<URL> target = readBookmarkFile(url.path());
  if (target && !physicalPathOf(target.value->path())) {
    return fileError(FileErrorCode::NoSuchFile, target.value->path(), "what the bookmark names is not there");
  }
  return target;
}

bool LocalCloudDocuments::isPromise(const URL& url) { return isPromiseName(url.lastPathComponent()); }

URL LocalCloudDocuments::logicalURLOfPromise(const URL& url) {
  if (!isPromise(url)) return url;
  const std::optional<std::string> logical = logicalNameOf(url.path());
  return logical ? URL(*logical) : url;
}

URL LocalCloudDocuments::physicalURL(const URL& url) {
  const std::optional<std::string> physical = physicalPathOf(url.path());
  return physical && *physical != url.path() ? URL(*physical) : url;
}

Result<std::vector<std::string>> LocalCloudDocuments::tagNames(const URL& url) {
  const std::optional<std::string> physical = physicalPathOf(url.path());
  if (!physical) return fileError(FileErrorCode::NoSuchFile, url.path(), "there is no such item");
  return tagNamesAt(*physical);
}

bool LocalCloudDocuments::canMoveWithoutDownloading(const CloudContainer& from, const CloudContainer& to) {
  return from.identifier() != to.identifier();
}

std::optional<Error> LocalCloudDocuments::evict(const URL& url) {
  return fileError(FileErrorCode::FeatureUnsupported, url.path(), "the drive keeps no other copy of this document");
}

Result<StorageFigures> LocalCloudDocuments::measureStorage() const {
  const std::string mirror = layout_.mirrorRoot();
  if (!account_.token()) return cloudError(CloudDocumentsErrorCode::NoAccount, mirror, "no account is signed in");
  struct statvfs disk = {};
  if (::statvfs(mirror.c_str(), &disk) != 0) return errorFromErrno(errno, mirror, FileAccess::Read);
  if (disk.f_blocks == 0) return fileError(FileErrorCode::ReadUnknown, mirror, "the disk doesn't tell how large it is");
  StorageFigures figures = storageFigures(disk.f_bavail, disk.f_blocks, disk.f_frsize);
  if (const std::optional<std::int64_t> allowance = account_.record().allowance) {
    const std::int64_t used = usedBytes(mirror);
    figures.free = std::clamp<std::int64_t>(*allowance - used, 0, figures.free);
    // Of an allowance that the disk has no room for no more can be used, or bought.
    figures.total = used < *allowance - figures.free ? used + figures.free : *allowance;
  }
  return figures;
}

void LocalCloudDocuments::fetchQuota(std::function<void(Result<std::int64_t>)> done) {
  {
    const std::lock_guard lock(quotaMutex_);
    quotaWaiting_.push_back(std::move(done));
    // Counting the documents takes a while; whoever asks meanwhile gets the same answer.
    if (quotaWaiting_.size() > 1) return;
  }
  workers_->addOperation([this] {
    const Result<StorageFigures> measured = measureStorage();
    if (measured && storageObserver_) storageObserver_(*measured.value);
    std::vector<std::function<void(Result<std::int64_t>)>> waiting;
    {
      const std::lock_guard lock(quotaMutex_);
      waiting.swap(quotaWaiting_);
    }
    const Result<std::int64_t> free = measured ? Result<std::int64_t>(measured.value->free) : *measured.error;
    for (const auto& each : waiting) each(free);
  });
}

}  // namespace vaelo
