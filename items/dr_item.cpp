// SPDX-License-Identifier: GPL-3.0-or-later
#include "items/dr_item.h"

#include <stdexcept>

#include "items/file_utils.h"
#include "items/url_additions.h"
#include "items/vlo_log.h"
#include "platform/platform.h"
#include "platform/ui/screen_factory.h"

namespace vaelo {

namespace {

bool skipUnreadable(const URL& entry, const Error& error) {
  VLO_INFO("Error enumerating %@: %@", entry, error);
  return true;
}

}  // namespace

std::shared_ptr<DRItem> DRItem::init() { throw std::invalid_argument(logFormatted("Don't call %@.", {"-[DRItem init]"})); }

std::shared_ptr<DRItem> DRItem::initWithURL(const std::optional<URL>& url) {
  std::shared_ptr<DRItem> item(new DRItem());
  item->url_ = url;
  if (item->cacheValues()) return item;
  VLO_ERROR("Failed to cache values for URL %@", url);
  return nullptr;
}

void DRItem::setUrl(const std::optional<URL>& url) {
  if (url == url_) return;
  url_ = url;
  cacheValues();
}

const std::vector<ResourceKey>& DRItem::resourceKeys() {
  static const std::vector<ResourceKey> keys{ResourceKey::Name,
                                             ResourceKey::LocalizedName,
                                             ResourceKey::TypeIdentifier,
                                             ResourceKey::LocalizedTypeDescription,
                                             ResourceKey::FileSize,
                                             ResourceKey::CreationDate,
                                             ResourceKey::ContentModificationDate,
                                             ResourceKey::IsDirectory,
                                             ResourceKey::IsPackage,
                                             ResourceKey::HasHiddenExtension,
                                             ResourceKey::ParentDirectoryURL,
                                             ResourceKey::IsShared,
                                             ResourceKey::SharedItemRole,
                                             ResourceKey::DownloadingStatus};
  return keys;
}

const std::shared_ptr<OperationQueue>& DRItem::getThumbnailQueue() {
  static const std::shared_ptr<OperationQueue> queue =
      Platform::current().queues.makeOperationQueue("thumbnailQueue", QualityOfService::Background);
  return queue;
}

bool DRItem::isPromise() const { return promiseURL_ && !(resolvedURL_ && promiseURL_->sameObject(*resolvedURL_)); }

void DRItem::clearValues() {
  resolvedURL_.reset();
  localizedName_.reset();
  typeIdentifier_.reset();
  localizedTypeDescription_.reset();
  fileSize_.reset();
  friendlyFileSize_.reset();
  creationDate_.reset();
  contentModificationDate_.reset();
  parentDirectoryURL_.reset();
  thumbnail_.reset();
  tags_.reset();
  promiseURL_.reset();
  symlinkTarget_.reset();
  isContainer_ = isDirectory_ = isPackage_ = thumbnailFetched_ = isBookmark_ = isDownloaded_ = isSymlink_ = false;
  hasHiddenExtension_ = renameable_ = true;
}

bool DRItem::cacheValues() {
  clearValues();
  if (!url_) return false;
  Platform& platform = Platform::current();
  resolvedURL_ = vlo_URLByResolvingBookmark(*url_);
  isBookmark_ = platform.cloudDocuments.isExternalDocumentReference(*url_);
  // A bookmark that leads nowhere: as for any read that never comes about, the record stands with what is known so far.
  if (!resolvedURL_) return true;
  promiseURL_ = platform.cloudDocuments.physicalURL(*resolvedURL_);
  // A link changes resolvedURL_ during the read; the access is that of the URL from before.
  const URL described = *resolvedURL_;
  const bool accessing = platform.resourceValues.startAccessingSecurityScopedResource(described);
  bool success = true;
  platform.fileCoordination.makeCoordinator()->coordinateReading(
      described, ReadingImmediatelyAvailableMetadataOnly, [&](const URL& newURL) {
        success = readValues(newURL);
        // Only a read that worked stops the access; one that failed keeps it.
        if (success && accessing) platform.resourceValues.stopAccessingSecurityScopedResource(described);
      });
  return success || initFromAttributes();
}

bool DRItem::readValues(const URL& newURL) {
  Platform& platform = Platform::current();
  if (!platform.resourceValues.promisedItemIsReachable(newURL)) return false;
  Result<ResourceMap> values = platform.resourceValues.promisedItemResourceValues(newURL, resourceKeys());
  if (values.error && values.error->domain == FileErrorDomain && values.error->code == FileErrorCode::NoSuchFile) {
    return false;
  }
  if (!values.value) {
    VLO_WARNING("promisedItemResourceValuesForKeys failed on %@", newURL);
    values = platform.resourceValues.resourceValues(newURL, resourceKeys());
    if (!values.value) return false;
  }
  initFromKeysAndValuesWithURL(*values.value, newURL);
  canPreview_ = resolvedURL_ && platform.screens.canPreviewItem(*resolvedURL_);
  if (resolvedURL_) tags_ = platform.cloudDocuments.tagNames(*resolvedURL_).value;
  return true;
}

std::optional<URL> DRItem::resolveRoverAlias(const std::optional<URL>& url) const {
  if (isPromise()) {
    VLO_WARNING("Rover Alias is promised -- unable to determine target without downloading: %@", url);
  }
  if (!url) return std::nullopt;
  const Result<URL> target = Platform::current().resourceValues.resolveAliasFile(*url);
  if (target.error) {
    VLO_WARNING("Error resolving Alias: %@", *target.error);
    return std::nullopt;
  }
  return target.value;
}

std::uint64_t DRItem::sizeOfPackage(const std::optional<URL>& url) const {
  if (!url) {
    VLO_ERROR("sizeOfPackage: null URL");
    return 0;
  }
  Platform& platform = Platform::current();
  std::uint64_t sum = 0;
  const std::vector<ResourceKey> prefetched{ResourceKey::IsDirectory, ResourceKey::IsPackage, ResourceKey::TotalFileSize,
                                            ResourceKey::FileSize};
  platform.fileManager.enumerate(
      *url, prefetched, EnumerateAll,
      [&](const URL& entry) {
        const Result<ResourceMap> values =
            platform.resourceValues.promisedItemResourceValues(entry, {ResourceKey::FileSize});
        if (values.value && values.value->contains(ResourceKey::FileSize)) {
          sum += values.value->at(ResourceKey::FileSize).unsignedValue();
        }
        return true;
      },
      skipUnreadable);
  return sum;
}

std::string DRItem::description() const {
  const auto orSame = [&](const std::optional<URL>& other) {
    return other == url_ ? LogArgument("<same>") : LogArgument(other);
  };
  return logFormatted(
      "Name=%@, Size=%@, URL=%@, ResURL=%@, PromiseURL=%@, %@%@%@%@",
      {localizedName_, fileSize_, url_, orSame(resolvedURL_), orSame(promiseURL_), isDirectory_ ? "Directory, " : "",
       isPackage_ ? "Package, " : "", storedPromiseFlag_ ? "Promise, " : "Local,", isSymlink_ ? "Symlink, " : ""});
}

ImageRef DRItem::thumbnail() {
  if (!thumbnailFetched_) {
    thumbnailFetched_ = true;
    if (resolvedURL_) {
      Platform& platform = Platform::current();
      const URL described = *resolvedURL_;
      const bool accessing = platform.resourceValues.startAccessingSecurityScopedResource(described);
      platform.fileCoordination.makeCoordinator()->coordinateReading(
          described, ReadingImmediatelyAvailableMetadataOnly, [&](const URL& newURL) {
            updateThumbnailImage(FileUtils::getResourceValueForURL(ResourceKey::ThumbnailDictionary, newURL));
            if (accessing) platform.resourceValues.stopAccessingSecurityScopedResource(described);
          });
    }
  }
  return thumbnail_;
}

void DRItem::updateThumbnailImage(const Value& thumbnails) {
  const Dictionary* images = thumbnails.dictionary();
  if (!images) return;
  VLO_DEBUG("URL Thumbs: %@", thumbnails);
  const auto found = images->find(Thumbnail1024SizeKey);
  if (found == images->end()) return;
  if (const ImageRef* image = found->second.get<ImageRef>()) thumbnail_ = *image;
}

std::optional<std::string> DRItem::friendlyDateStyle(const Value& date, DateStyle style) {
  const Date* moment = date.get<Date>();
  if (!moment) return std::nullopt;
  return Platform::current().formatting.localizedDate(*moment, style, DateStyle::Short);
}

std::optional<std::string> DRItem::friendlyCreationDate(DateStyle style) const {
  return friendlyDateStyle(creationDate_ ? Value(*creationDate_) : Value(), style);
}

std::optional<std::string> DRItem::friendlyContentModificationDate(DateStyle style) const {
  return friendlyDateStyle(contentModificationDate_ ? Value(*contentModificationDate_) : Value(), style);
}

}  // namespace vaelo
