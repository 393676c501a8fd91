// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/files/local_resource_values.h"

#include <fcntl.h>
#include <glib.h>
#include <sys/stat.h>

#include <cerrno>
#include <climits>
#include <cstdlib>

#include "host/drive/alias_file.h"
#include "host/drive/bookmark_file.h"
#include "host/drive/item_attributes.h"
#include "host/drive/packages.h"
#include "host/drive/promise_file.h"
#include "host/files/file_times.h"
#include "host/files/system_error.h"
#include "host/support/glib_ptr.h"

namespace vaelo {

/// Answers keys for one item, either from what stands on the disk or from a promise.
class LocalResourceValues::Reader {
 public:
  Reader(LocalResourceValues& owner, URL url) : owner_(owner), url_(std::move(url)), name_(url_.lastPathComponent()) {}

  int readFile(const std::string& path) {
    return statx(AT_FDCWD, path.c_str(), AT_SYMLINK_NOFOLLOW, STATX_BASIC_STATS | STATX_BTIME, &info_) == 0 ? 0 : errno;
  }
  void usePromise(PromiseInfo promise) { promise_ = std::move(promise); }

  Value valueOf(ResourceKey key) {
    switch (key) {
      case ResourceKey::Name:
        return name_;
      case ResourceKey::LocalizedName:
        return displayName();
      case ResourceKey::TypeIdentifier:
        return typeIdentifier();
      case ResourceKey::LocalizedTypeDescription:
        return typeDescription();
      case ResourceKey::FileSize:
      case ResourceKey::TotalFileSize:
        return size();
      case ResourceKey::CreationDate:
        return creationDate();
      case ResourceKey::ContentModificationDate:
        return modificationDate();
      case ResourceKey::IsDirectory:
        return isFolder();
      case ResourceKey::IsPackage:
        return isPackage();
      case ResourceKey::IsRegularFile:
        return promise_ ? !promise_->package : S_ISREG(info_.stx_mode);
      case ResourceKey::HasHiddenExtension:
        return extensionIsHidden();
      case ResourceKey::ParentDirectoryURL:
        return url_.deletingLastPathComponent();
      case ResourceKey::IsShared:
        return role().has_value();
      case ResourceKey::SharedItemRole:
        return role() ? Value(*role()) : Value();
      case ResourceKey::DownloadingStatus:
        return downloadingStatus();
      case ResourceKey::DocumentIdentifier:
        return documentIdentifier();
      case ResourceKey::ThumbnailDictionary:
        return thumbnails();
    }
    return {};
  }

 private:
  bool isFolder() const { return promise_ ? promise_->package : S_ISDIR(info_.stx_mode); }
  bool isPackage() const { return promise_ ? promise_->package : S_ISDIR(info_.stx_mode) && isPackageName(name_); }
  bool isAlias() const { return !promise_ && S_ISREG(info_.stx_mode) && isAliasName(name_) && readAliasFile(url_.path()); }
  /// By the item's own wish; that of a reference says how it is stored, not what it is called.
  bool extensionIsHidden() const {
    if (url_.pathExtension().empty() || (isFolder() && !isPackage())) return false;
    if (promise_) return promise_->extensionHidden;
    const bool isBookmark = S_ISREG(info_.stx_mode) && isBookmarkName(name_);
    return isBookmark || isAlias() || extensionIsHiddenAt(url_.path());
  }
  /// A person reads text, whatever bytes the name has.
  std::string displayName() const {
    const std::size_t extension = extensionIsHidden() ? url_.pathExtension().size() + 1 : 0;
    return takeString(g_filename_display_name(name_.substr(0, name_.size() - extension).c_str()));
  }
  std::string typeIdentifier() const {
    if (!promise_ && S_ISLNK(info_.stx_mode)) return "public.symlink";
    if (isFolder() && !isPackage()) return "public.folder";
    // Has no description of its own, so that the one below stands.
    if (isAlias()) return "com.marrow.alias";
    const auto type = owner_.types_.preferredIdentifierForExtension(url_.pathExtension());
    return type.value_or(isPackage() ? "com.marrow.package" : "public.data");
  }
  Value typeDescription() const {
    if (isAlias()) return "Alias";
    const auto text = owner_.types_.description(typeIdentifier());
    return text ? Value(*text) : Value();
  }
  Value size() const {
    if (promise_) return Value(promise_->size);
    if (S_ISDIR(info_.stx_mode)) return {};
    return Value(static_cast<std::uint64_t>(info_.stx_size));
  }
  static Value valueOf(const std::optional<Date>& date) { return date ? Value(*date) : Value(); }
  Value creationDate() const {
    if (promise_) return valueOf(promise_->created);
    return info_.stx_mask & STATX_BTIME ? valueOf(dateOf(info_.stx_btime)) : Value();
  }
  Value modificationDate() const { return valueOf(promise_ ? promise_->modified : dateOf(info_.stx_mtime)); }
  const std::optional<std::string>& role() {
    if (!roleRead_) {
      roleRead_ = true;
      role_ = promise_ ? promise_->share : sharedItemRoleAt(url_.path());
    }
    return role_;
  }
  Value downloadingStatus() const {
    if (promise_) return DownloadingStatusNotDownloaded;
    return owner_.layout_.isInMirror(url_.path()) ? Value(DownloadingStatusCurrent) : Value();
  }
  Value thumbnails() const {
    if (promise_ || !S_ISREG(info_.stx_mode) || !owner_.thumbnails_) return {};
    const ImageRef image = owner_.thumbnails_(url_.path());
    return image ? Value(Dictionary{{Thumbnail1024SizeKey, Value(image)}}) : Value();
  }
  Value documentIdentifier() const {
    const Result<std::int64_t> id = owner_.index_.documentIDFor(url_.path(), true);
    return id.value && *id.value != 0 ? Value(*id.value) : Value();
  }

  LocalResourceValues& owner_;
  const URL url_;
  const std::string name_;
  struct statx info_ {};
  std::optional<PromiseInfo> promise_;
  std::optional<std::string> role_;
  bool roleRead_ = false;
};

LocalResourceValues::LocalResourceValues(const DriveLayout& layout, DocumentIndex& index, TypeIdentifiers& types)
    : layout_(layout), index_(index), types_(types) {}

namespace {

template <typename Reader>
ResourceMap valuesFor(Reader& reader, const std::vector<ResourceKey>& keys) {
  ResourceMap values;
  for (const ResourceKey key : keys) {
    Value value = reader.valueOf(key);
    if (value.isPresent()) values.emplace(key, std::move(value));
  }
  return values;
}

/// Of what isn't there callers ask with the code that stands for any missing item.
Error errorFor(int number, const URL& url) {
  Error error = describedError(number, url.path(), FileAccess::Read);
  if (error.code == FileErrorCode::ReadNoSuchFile) error.code = FileErrorCode::NoSuchFile;
  return error;
}

}  // namespace

Result<ResourceMap> LocalResourceValues::resourceValues(const URL& url, const std::vector<ResourceKey>& keys) {
  Reader reader(*this, url);
  if (const int failure = reader.readFile(url.path())) return errorFor(failure, url);
  return valuesFor(reader, keys);
}

Result<ResourceMap> LocalResourceValues::promisedItemResourceValues(const URL& url, const std::vector<ResourceKey>& keys) {
  std::string promisePath = url.path();
  if (!isPromiseName(url.lastPathComponent())) {
    Reader reader(*this, url);
    const int failure = reader.readFile(url.path());
    if (failure == 0) return valuesFor(reader, keys);
    const std::optional<std::string> physical = failure == ENOENT ? physicalPathOf(url.path()) : std::nullopt;
    if (!physical) return errorFor(failure, url);
    promisePath = *physical;
  }
  const std::optional<std::string> logical = logicalNameOf(promisePath);
  Result<PromiseInfo> promise = readPromise(promisePath);
  if (!promise || !logical) {
    const bool gone = promise.error && promise.error->code == FileErrorCode::ReadNoSuchFile;
    return errorFor(gone ? ENOENT : EIO, url);
  }
  Reader reader(*this, *logical == url.path() ? url : URL(*logical, promise.value->package));
  reader.usePromise(std::move(*promise.value));
  return valuesFor(reader, keys);
}

bool LocalResourceValues::promisedItemIsReachable(const URL& url) { return physicalPathOf(url.path()).has_value(); }

URL LocalResourceValues::resolvingSymlinks(const URL& url) {
  const auto resolved = [](const std::string& path) -> std::optional<std::string> {
    char real[PATH_MAX];
    if (!realpath(path.c_str(), real)) return std::nullopt;
    return real;
  };
  std::optional<std::string> path = resolved(url.path());
  const std::optional<std::string> physical = path ? std::nullopt : physicalPathOf(url.path());
  // An item that is not downloaded is no link itself, but may be reached through one.
  if (physical && *physical != url.path()) {
    path = resolved(url.deletingLastPathComponent().path());
    if (path) *path += "/" + url.lastPathComponent();
  }
  return path && *path != url.path() ? URL(*path, url.hasDirectoryPath()) : url;
}

Result<URL> LocalResourceValues::resolveAliasFile(const URL& url) {
  Result<URL> target = readAliasFile(url.path());
  if (target.error && !target.error->localizedDescription) {
    target.error->localizedDescription = describedError(EIO, url.path(), FileAccess::Read).localizedDescription;
  }
  return target;
}

}  // namespace vaelo
