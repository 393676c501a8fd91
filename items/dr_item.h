// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <functional>
#include <memory>
#include <optional>
#include <string>
#include <vector>

#include "platform/formatting.h"
#include "platform/queues.h"
#include "platform/resource_values.h"

namespace vaelo {

/// The record of one item of the drive: what the screens show of it and judge it by, read once. It never writes to the
/// file system. It holds no lock: the owner keeps refills (setUrl) and reads apart. Making one blocks on the disk.
class DRItem {
 public:
  /// Not to be called: throws std::invalid_argument.
  static std::shared_ptr<DRItem> init();
  /// Null when nothing can be told about the URL.
  static std::shared_ptr<DRItem> initWithURL(const std::optional<URL>& url);

  /// The URL as given; may be a bookmark or a promise.
  const std::optional<URL>& url() const { return url_; }
  /// Refills the record, unless the URL is equal to the one it has.
  void setUrl(const std::optional<URL>& url);
  /// What the record describes: bookmark resolved, links and aliases followed.
  const std::optional<URL>& resolvedURL() const { return resolvedURL_; }
  void setResolvedURL(std::optional<URL> url) { resolvedURL_ = std::move(url); }
  const std::optional<std::string>& localizedName() const { return localizedName_; }
  void setLocalizedName(std::optional<std::string> name) { localizedName_ = std::move(name); }
  const std::optional<std::string>& typeIdentifier() const { return typeIdentifier_; }
  void setTypeIdentifier(std::optional<std::string> type) { typeIdentifier_ = std::move(type); }
  const std::optional<std::string>& localizedTypeDescription() const { return localizedTypeDescription_; }
  void setLocalizedTypeDescription(std::optional<std::string> text) { localizedTypeDescription_ = std::move(text); }
  /// Bytes.
  const std::optional<std::uint64_t>& fileSize() const { return fileSize_; }
  void setFileSize(std::optional<std::uint64_t> bytes) { fileSize_ = bytes; }
  const std::optional<std::string>& friendlyFileSize() const { return friendlyFileSize_; }
  void setFriendlyFileSize(std::optional<std::string> text) { friendlyFileSize_ = std::move(text); }
  const std::optional<Date>& creationDate() const { return creationDate_; }
  void setCreationDate(std::optional<Date> date) { creationDate_ = date; }
  const std::optional<Date>& contentModificationDate() const { return contentModificationDate_; }
  void setContentModificationDate(std::optional<Date> date) { contentModificationDate_ = date; }
  const std::optional<URL>& parentDirectoryURL() const { return parentDirectoryURL_; }
  void setParentDirectoryURL(std::optional<URL> url) { parentDirectoryURL_ = std::move(url); }
  bool isContainer() const { return isContainer_; }
  void setIsContainer(bool flag) { isContainer_ = flag; }
  /// False for a package.
  bool isDirectory() const { return isDirectory_; }
  void setIsDirectory(bool flag) { isDirectory_ = flag; }
  bool isPackage() const { return isPackage_; }
  bool hasHiddenExtension() const { return hasHiddenExtension_; }
  void setHasHiddenExtension(bool flag) { hasHiddenExtension_ = flag; }
  /// Whether the quick preview can show the resolved URL.
  bool canPreview() const { return canPreview_; }
  bool renameable() const { return renameable_; }
  void setRenameable(bool flag) { renameable_ = flag; }
  bool isBookmark() const { return isBookmark_; }
  void setIsBookmark(bool flag) { isBookmark_ = flag; }
  const std::optional<std::vector<std::string>>& tags() const { return tags_; }
  void setTags(std::optional<std::vector<std::string>> tags) { tags_ = std::move(tags); }
  bool isDownloaded() const { return isDownloaded_; }
  void setIsDownloaded(bool flag) { isDownloaded_ = flag; }
  /// True for a symbolic link and for an alias file.
  bool isSymlink() const { return isSymlink_; }
  /// The physical URL behind the resolved one.
  const std::optional<URL>& promiseURL() const { return promiseURL_; }
  void setPromiseURL(std::optional<URL> url) { promiseURL_ = std::move(url); }
  /// True when there is a promise URL that is not the very object of the resolved URL.
  bool isPromise() const;
  /// Sets a flag that only description() reads.
  void setIsPromise(bool flag) { storedPromiseFlag_ = flag; }
  /// As stored in a symbolic link.
  const std::optional<std::string>& symlinkTarget() const { return symlinkTarget_; }

  /// The 1024 x 1024 thumbnail; the first call of a fill looks for it.
  ImageRef thumbnail();
  void setThumbnail(ImageRef image) { thumbnail_ = std::move(image); }
  bool thumbnailFetched() const { return thumbnailFetched_; }
  void setThumbnailFetched(bool flag) { thumbnailFetched_ = flag; }
  /// Takes the 1024 x 1024 image out of a dictionary of thumbnails; anything else is ignored.
  void updateThumbnailImage(const Value& thumbnails);
  /// The record never draws thumbnails itself: always false, and a completion with no image.
  bool canGenerateThumbnail() const { return false; }
  void generateThumbnail(const std::function<void(ImageRef)>& completion) const { completion(nullptr); }
  /// The queue for thumbnail work, one for the whole process.
  static const std::shared_ptr<OperationQueue>& getThumbnailQueue();

  /// Date with the style, time short; nothing when the field is absent.
  std::optional<std::string> friendlyCreationDate(DateStyle style) const;
  std::optional<std::string> friendlyContentModificationDate(DateStyle style) const;
  static std::optional<std::string> friendlyDateStyle(const Value& date, DateStyle style);
  /// Bytes of all files below the URL, hidden ones too.
  std::uint64_t sizeOfPackage(const std::optional<URL>& url) const;
  std::string description() const;

  /// The fourteen keys that every fill reads, in their order.
  static const std::vector<ResourceKey>& resourceKeys();
  bool cacheValues();
  void clearValues();
  void initFromKeysAndValuesWithURL(const ResourceMap& values, const URL& url);
  bool initFromAttributes();
  std::optional<URL> resolveRoverAlias(const std::optional<URL>& url) const;

 private:
  DRItem() = default;
  bool readValues(const URL& newURL);
  void followLink(const std::optional<URL>& target);
  void takeFileSize(const Value& size);
  void takeContainerOrSharing(const ResourceMap& values, const URL& url);

  std::optional<URL> url_;
  std::optional<URL> resolvedURL_;
  std::optional<URL> promiseURL_;
  std::optional<URL> parentDirectoryURL_;
  std::optional<std::string> localizedName_;
  std::optional<std::string> typeIdentifier_;
  std::optional<std::string> localizedTypeDescription_;
  std::optional<std::string> friendlyFileSize_;
  std::optional<std::string> symlinkTarget_;
  std::optional<std::uint64_t> fileSize_;
  std::optional<Date> creationDate_;
  std::optional<Date> contentModificationDate_;
  std::optional<std::vector<std::string>> tags_;
  ImageRef thumbnail_;
  bool isContainer_ = false;
  bool isDirectory_ = false;
  bool isPackage_ = false;
  bool hasHiddenExtension_ = true;
  bool canPreview_ = false;
  bool renameable_ = true;
  bool isBookmark_ = false;
  bool isDownloaded_ = false;
  bool isSymlink_ = false;
  bool thumbnailFetched_ = false;
  bool storedPromiseFlag_ = false;
};

}  // namespace vaelo
