// SPDX-License-Identifier: GPL-3.0-or-later
// The two ways in which a record is filled: from resource values, and from plain attributes when there are none.
#include "items/dr_item.h"
#include "items/vlo_log.h"
#include "platform/platform.h"

namespace vaelo {

namespace {

Value valueOf(const ResourceMap& values, ResourceKey key) {
  const auto found = values.find(key);
  return found == values.end() ? Value() : found->second;
}

template <typename T>
std::optional<T> typed(const Value& value) {
  const T* held = value.get<T>();
  return held ? std::optional<T>(*held) : std::nullopt;
}

/// A path as a link stores it, against the folder that holds the link.
std::optional<URL> relativeTo(const std::optional<std::string>& target, const std::optional<URL>& folder) {
  if (!target || !folder) return std::nullopt;
  return target->starts_with('/') ? URL(*target) : folder->appendingPathComponent(*target);
}

bool hasOneComponent(const URL& url) { return url.pathComponents().size() == 1; }

}  // namespace

void DRItem::takeFileSize(const Value& size) {
  fileSize_.reset();
  friendlyFileSize_.reset();
  if (!size.isNumber()) return;
  fileSize_ = size.unsignedValue();
  friendlyFileSize_ = Platform::current().formatting.byteCount(*fileSize_, ByteCountStyle::File);
}

void DRItem::followLink(const std::optional<URL>& target) {
  isSymlink_ = true;
  resolvedURL_ = target;
  // A target that is one component is read against the folder of the link, as far as these are known by now.
  if (resolvedURL_ && hasOneComponent(*resolvedURL_)) resolvedURL_ = relativeTo(symlinkTarget_, parentDirectoryURL_);
}

void DRItem::initFromKeysAndValuesWithURL(const ResourceMap& values, const URL& url) {
  Platform& platform = Platform::current();
  localizedName_ = typed<std::string>(valueOf(values, ResourceKey::LocalizedName));
  if (!localizedName_) localizedName_ = typed<std::string>(valueOf(values, ResourceKey::Name));
  typeIdentifier_ = typed<std::string>(valueOf(values, ResourceKey::TypeIdentifier));
  localizedTypeDescription_ = typed<std::string>(valueOf(values, ResourceKey::LocalizedTypeDescription));
  if (typeIdentifier_) {
    if (auto description = platform.types.description(*typeIdentifier_)) localizedTypeDescription_ = description;
  }
  if (typeIdentifier_ == "public.symlink") {
    followLink(platform.resourceValues.resolvingSymlinks(url));
  } else if (localizedTypeDescription_ &&
             platform.characterClasses.localizedCaseInsensitiveEquals(*localizedTypeDescription_, "Alias")) {
    followLink(resolveRoverAlias(url_));
  }
  takeFileSize(valueOf(values, ResourceKey::FileSize));
  creationDate_ = typed<Date>(valueOf(values, ResourceKey::CreationDate));
  contentModificationDate_ = typed<Date>(valueOf(values, ResourceKey::ContentModificationDate));
  parentDirectoryURL_ = typed<URL>(valueOf(values, ResourceKey::ParentDirectoryURL));
  isDirectory_ = valueOf(values, ResourceKey::IsDirectory).boolValue();
  isPackage_ = valueOf(values, ResourceKey::IsPackage).boolValue();
  if (isPackage_) {
    isDirectory_ = false;
    if (!fileSize_) {
      if (const std::uint64_t sum = sizeOfPackage(resolvedURL_)) takeFileSize(Value(sum));
    }
  }
  hasHiddenExtension_ = valueOf(values, ResourceKey::HasHiddenExtension).boolValue();
  takeContainerOrSharing(values, url);
  const Value status = valueOf(values, ResourceKey::DownloadingStatus);
  isDownloaded_ = status.isPresent() && !(status == Value(DownloadingStatusNotDownloaded));
}

void DRItem::takeContainerOrSharing(const ResourceMap& values, const URL& url) {
  CloudDocuments& cloud = Platform::current().cloudDocuments;
  isContainer_ = cloud.isDocumentsContainer(url);
  renameable_ = !isContainer_;
  if (isContainer_) {
    const Result<CloudContainerRef> container = cloud.containerForURL(url);
    if (container.value && *container.value && !container.error) localizedName_ = (*container.value)->localizedName();
  } else if (valueOf(values, ResourceKey::IsShared).boolValue() &&
             valueOf(values, ResourceKey::SharedItemRole) == Value(SharedItemRoleParticipant)) {
    renameable_ = false;
  }
}

bool DRItem::initFromAttributes() {
  if (!url_) return false;
  Platform& platform = Platform::current();
  const Result<FileAttributes> read = platform.fileManager.attributesOfItemAtPath(url_->path());
  if (!read.value) return false;
  const FileAttributes& attributes = *read.value;
  localizedName_ = url_->lastPathComponent();
  parentDirectoryURL_ = url_->deletingLastPathComponent();
  switch (attributes.type.value_or(FileType::Regular)) {
    case FileType::SymbolicLink: {
      typeIdentifier_ = "public.symlink";
      isSymlink_ = true;
      symlinkTarget_ = platform.fileManager.destinationOfSymbolicLinkAtPath(url_->path()).value;
      if (symlinkTarget_) {
        resolvedURL_ = URL(*symlinkTarget_);
        if (hasOneComponent(*resolvedURL_)) resolvedURL_ = relativeTo(symlinkTarget_, parentDirectoryURL_);
      }
      break;
    }
    case FileType::Directory:
      typeIdentifier_ = "public.folder";
      isDirectory_ = true;
      break;
    case FileType::Regular:
      break;
    case FileType::Other:
      return false;
  }
  promiseURL_.reset();
  if (resolvedURL_) promiseURL_ = platform.cloudDocuments.physicalURL(*resolvedURL_);
  if (typeIdentifier_) {
    if (auto description = platform.types.description(*typeIdentifier_)) localizedTypeDescription_ = description;
  }
  takeFileSize(attributes.size);
  creationDate_ = attributes.creationDate;
  contentModificationDate_ = attributes.modificationDate;
  hasHiddenExtension_ = attributes.extensionHidden;
  return localizedName_ && !localizedName_->empty();
}

}  // namespace vaelo
