// SPDX-License-Identifier: GPL-3.0-or-later
#include "tests/support/memory_resource_values.h"

#include <algorithm>

#include "tests/support/memory_characters.h"
#include "tests/support/memory_drive_places.h"
#include "tests/support/memory_error.h"
#include "tests/support/memory_packages.h"

namespace vaelo {

namespace {

/// A person reads text, whatever bytes a name has.
std::string readableText(const std::string& name) {
  MemoryCharacters characters;
  if (!characters.containsIllegalCharacter(name)) return name;
  std::string text = name;
  std::replace_if(
      text.begin(), text.end(), [](unsigned char c) { return c >= 0x80; }, '?');
  return text;
}

bool hidesExtension(const MemoryItem& item, const URL& url) {
  if (url.pathExtension().empty() || (item.isFolder() && !isMemoryPackage(url))) return false;
  return item.attributes.extensionHidden || item.bookmarkTarget || item.aliasTarget;
}

std::string shownName(const MemoryItem& item, const URL& url) {
  const std::string name = url.lastPathComponent();
  return hidesExtension(item, url) ? name.substr(0, name.size() - url.pathExtension().size() - 1) : name;
}

}  // namespace

std::string MemoryResourceValues::typeOf(const MemoryItem& item, const URL& url) {
  if (item.type() == FileType::SymbolicLink) return "public.symlink";
  const bool isFolder = item.isFolder();
  if (isFolder && !isMemoryPackage(url)) return "public.folder";
  if (item.aliasTarget) return "com.marrow.alias";
  return types_.preferredIdentifierForExtension(url.pathExtension()).value_or("public.data");
}

Value MemoryResourceValues::valueOf(MemoryItem& item, const URL& url, ResourceKey key, bool asPromise) {
  const bool isFolder = item.isFolder();
  switch (key) {
    case ResourceKey::Name:
      return url.lastPathComponent();
    case ResourceKey::LocalizedName:
      return readableText(shownName(item, url));
    case ResourceKey::TypeIdentifier:
      return typeOf(item, url);
    case ResourceKey::LocalizedTypeDescription: {
      if (item.aliasTarget) return "Alias";
      const auto text = types_.description(typeOf(item, url));
      return text ? Value(*text) : Value();
    }
    case ResourceKey::FileSize:
    case ResourceKey::TotalFileSize:
      return isFolder && !asPromise ? Value() : item.attributes.size;
    case ResourceKey::CreationDate:
      return item.attributes.creationDate ? Value(*item.attributes.creationDate) : Value();
    case ResourceKey::ContentModificationDate:
      return item.attributes.modificationDate ? Value(*item.attributes.modificationDate) : Value();
    case ResourceKey::IsDirectory:
      return isFolder;
    case ResourceKey::IsPackage:
      return isFolder && isMemoryPackage(url);
    case ResourceKey::IsRegularFile:
      return !isFolder && item.type() != FileType::SymbolicLink;
    case ResourceKey::HasHiddenExtension:
      return hidesExtension(item, url);
    case ResourceKey::ParentDirectoryURL:
      return url.deletingLastPathComponent();
    case ResourceKey::IsShared:
      return item.shareRole.has_value();
    case ResourceKey::SharedItemRole:
      return item.shareRole ? Value(*item.shareRole) : Value();
    case ResourceKey::DownloadingStatus:
      if (asPromise) return DownloadingStatusNotDownloaded;
      return URL(disk_.realPath(url.path())).isInside(Mirror) ? Value(DownloadingStatusCurrent) : Value();
    case ResourceKey::DocumentIdentifier:
      return disk_.documentIDOf(item);
    case ResourceKey::ThumbnailDictionary:
      return {};
  }
  return {};
}

ResourceMap MemoryResourceValues::valuesOf(MemoryItem& item, const URL& url, const std::vector<ResourceKey>& keys,
                                           bool asPromise) {
  ResourceMap values;
  for (const ResourceKey key : keys) {
    const auto said = item.values.find(key);
    Value value = said != item.values.end() ? said->second : Value();
    if (said == item.values.end() && !item.hasOnlyValues) value = valueOf(item, url, key, asPromise);
    if (value.isPresent()) values.emplace(key, std::move(value));
  }
  return values;
}

Result<ResourceMap> MemoryResourceValues::promisedItemResourceValues(const URL& url, const std::vector<ResourceKey>& keys) {
  record_.calls.push_back("promised " + url.path());
  record_.lastKeys = keys;
  if (const auto answer = promisedAnswers.find(url.path()); answer != promisedAnswers.end()) return answer->second;
  if (promisedReadError) return *promisedReadError;
  MemoryItem* item = disk_.logicalItem(url.path());
  const std::string logical = item ? url.path() : disk_.logicalPath(url.path());
  if (!item) item = disk_.physicalItem(url.path());
  if (!item) return noSuchItem(url.path());
  if (disk_.isLocked(url.deletingLastPathComponent().path())) {
    return memoryError(FileErrorCode::ReadNoPermission, url.path());
  }
  return valuesOf(*item, logical == url.path() ? url : URL(logical), keys, item->isPromise);
}

Result<ResourceMap> MemoryResourceValues::resourceValues(const URL& url, const std::vector<ResourceKey>& keys) {
  record_.calls.push_back("plain " + url.path());
  record_.lastKeys = keys;
  if (const auto answer = plainAnswers.find(url.path()); answer != plainAnswers.end()) return answer->second;
  if (plainReadError) return *plainReadError;
  MemoryItem* item = disk_.physicalItem(url.path());
  if (!item) return noSuchItem(url.path());
  if (disk_.isLocked(url.deletingLastPathComponent().path())) {
    return memoryError(FileErrorCode::ReadNoPermission, url.path());
  }
  return valuesOf(*item, url, keys, false);
}

bool MemoryResourceValues::promisedItemIsReachable(const URL& url) {
  return !unreachable.contains(url.path()) && (disk_.logicalItem(url.path()) || disk_.physicalItem(url.path()));
}

URL MemoryResourceValues::resolvingSymlinks(const URL& url) {
  if (const auto target = linkTargets.find(url.path()); target != linkTargets.end()) return target->second;
  const std::string real = disk_.realPath(url.path());
  MemoryItem* item = disk_.logicalItem(real);
  // A link that is left is one in a circle.
  const bool leadsSomewhere = real == "/" || (item && item->type() != FileType::SymbolicLink);
  if (real == url.path() || !leadsSomewhere) return url;
  return URL(real, url.hasDirectoryPath());
}

Result<URL> MemoryResourceValues::resolveAliasFile(const URL& url) {
  record_.calls.push_back("resolveAlias " + url.path());
  if (const auto target = aliasTargets.find(url.path()); target != aliasTargets.end()) return target->second;
  const MemoryItem* item = disk_.physicalItem(url.path());
  if (!item) return noSuchItem(url.path(), FileErrorCode::ReadNoSuchFile);
  if (!item->aliasTarget) return memoryError(FileErrorCode::ReadUnknown, url.path(), "It is no alias");
  return *item->aliasTarget;
}

bool MemoryResourceValues::startAccessingSecurityScopedResource(const URL& url) {
  record_.calls.push_back("start " + url.path());
  if (securityScoped) ++openScopes;
  return securityScoped;
}

void MemoryResourceValues::stopAccessingSecurityScopedResource(const URL& url) {
  record_.calls.push_back("stop " + url.path());
  --openScopes;
}

}  // namespace vaelo
