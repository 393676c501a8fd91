// SPDX-License-Identifier: GPL-3.0-or-later
#include "tests/support/memory_file_manager.h"

#include "tests/support/memory_error.h"
#include "tests/support/memory_packages.h"

namespace vaelo {

namespace {

Error moveFailure(Error error, const URL& destination) {
  error.userInfo[DestinationFilePathErrorKey] = Value(destination.path());
  return error;
}

}  // namespace

bool MemoryFileManager::fileExistsAtPath(const std::string& path, bool* isDirectory) {
  // A link counts for what it leads to.
  const MemoryItem* item = disk_.physicalItem(path);
  if (item && item->type() == FileType::SymbolicLink) item = disk_.physicalItem(disk_.realPath(path));
  const bool exists = path == "/" || (item && item->type() != FileType::SymbolicLink);
  if (isDirectory) *isDirectory = path == "/" || (exists && item->isFolder());
  return exists;
}

Result<FileAttributes> MemoryFileManager::attributesOfItemAtPath(const std::string& path) {
  const MemoryItem* item = disk_.physicalItem(path);
  if (!item) return noSuchItem(path, FileErrorCode::ReadNoSuchFile);
  return item->attributes;
}

Result<std::string> MemoryFileManager::destinationOfSymbolicLinkAtPath(const std::string& path) {
  const MemoryItem* item = disk_.physicalItem(path);
  if (!item) return noSuchItem(path, FileErrorCode::ReadNoSuchFile);
  if (item->type() != FileType::SymbolicLink || item->linkTarget.empty()) {
    return memoryError(FileErrorCode::ReadUnknown, path, "It is no link");
  }
  return item->linkTarget;
}

std::optional<Error> MemoryFileManager::createDirectoryAtURL(const URL& url) {
  record_.calls.push_back("create " + url.path());
  if (createError) return createError;
  if (disk_.hasFolder(url.path())) return std::nullopt;
  if (isThere(url.path())) return memoryError(FileErrorCode::WriteFileExists, url.path());
  for (URL above = url.deletingLastPathComponent(); above.path() != "/"; above = above.deletingLastPathComponent()) {
    if (isThere(above.path()) && !disk_.hasFolder(above.path())) return noSuchItem(url.path());
  }
  if (url.lastPathComponent().size() > MemoryDisk::NameLimit) return memoryError(FileErrorCode::WriteUnknown, url.path());
  if (disk_.isLocked(url.path())) return memoryError(FileErrorCode::WriteNoPermission, url.path());
  disk_.addFolder(disk_.place(url.path()));
  return std::nullopt;
}

std::optional<Error> MemoryFileManager::removeItemAtURL(const URL& url) {
  record_.calls.push_back("remove " + url.path());
  if (removeError) return removeError;
  const std::string path = disk_.logicalItem(url.path()) ? url.path() : disk_.logicalPath(url.path());
  if (!isThere(path)) return noSuchItem(url.path());
  if (disk_.isLocked(path)) return memoryError(FileErrorCode::WriteNoPermission, url.path());
  disk_.remove(disk_.place(path));
  return std::nullopt;
}

std::optional<Error> MemoryFileManager::moveItemAtURL(const URL& source, const URL& destination) {
  record_.calls.push_back("move " + source.path() + " " + destination.path());
  if (moveError) return moveError;
  const std::string path = disk_.logicalItem(source.path()) ? source.path() : disk_.logicalPath(source.path());
  if (!isThere(path)) return moveFailure(noSuchItem(source.path()), destination);
  const std::string from = disk_.place(path);
  const std::string to = disk_.place(destination.path());
  if (from == to) return std::nullopt;
  if (isThere(to)) return moveFailure(memoryError(FileErrorCode::WriteFileExists, to), destination);
  if (URL(to).isInside(URL(from))) return moveFailure(memoryError(FileErrorCode::WriteUnknown, from), destination);
  if (!disk_.hasFolder(URL(to).deletingLastPathComponent().path())) return moveFailure(noSuchItem(from), destination);
  if (destination.lastPathComponent().size() > MemoryDisk::NameLimit) {
    return moveFailure(memoryError(FileErrorCode::WriteUnknown, to), destination);
  }
  if (disk_.isLocked(from) || disk_.isLocked(to)) {
    return moveFailure(memoryError(FileErrorCode::WriteNoPermission, from), destination);
  }
  disk_.move(from, to);
  return std::nullopt;
}

void MemoryFileManager::enumerate(const URL& url, const std::vector<ResourceKey>& prefetch, unsigned options,
                                  const std::function<bool(const URL&)>& visit,
                                  const std::function<bool(const URL&, const Error&)>& onError) {
  record_.calls.push_back("enumerate " + url.path());
  record_.lastKeys = prefetch;
  record_.lastOptions = options;
  // What can't be read comes first, so that a walk that ends there finds nothing.
  if (enumerationError && !onError(url.appendingPathComponent("locked"), *enumerationError)) return;
  if (!disk_.hasFolder(url.path())) {
    const bool isThere = fileExistsAtPath(url.path());
    onError(url, isThere ? memoryError(FileErrorCode::ReadUnknown, url.path())
                         : noSuchItem(url.path(), FileErrorCode::ReadNoSuchFile));
    return;
  }
  enumerateBelow(url, options, visit, onError);
}

bool MemoryFileManager::enumerateBelow(const URL& url, unsigned options, const std::function<bool(const URL&)>& visit,
                                       const std::function<bool(const URL&, const Error&)>& onError) {
  const std::string folder = disk_.realPath(url.path());
  if (disk_.isLocked(folder)) return onError(url, memoryError(FileErrorCode::ReadNoPermission, url.path()));
  std::vector<URL> entries;
  for (const auto& [path, item] : disk_.items) {
    if (path.compare(0, folder.size() + 1, folder + "/") != 0) continue;
    const std::string name = path.substr(folder.size() + 1, path.find('/', folder.size() + 1) - folder.size() - 1);
    // A folder that a test did not care to add is there nonetheless.
    const auto entry = disk_.items.find(folder + "/" + name);
    const bool isFolder = entry == disk_.items.end() || (entry->second.isFolder() && !entry->second.isPromise);
    const URL entryURL(url.path() + "/" + name, isFolder);
    if (entries.empty() || !(entries.back() == entryURL)) entries.push_back(entryURL);
  }
  for (const URL& entry : entries) {
    if ((options & SkipsHiddenFiles) && entry.lastPathComponent().front() == '.') continue;
    if (!visit(entry)) return false;
    if (!entry.hasDirectoryPath() || (options & SkipsSubdirectoryDescendants)) continue;
    if ((options & SkipsPackageDescendants) && isMemoryPackage(entry)) continue;
    if (!enumerateBelow(entry, options, visit, onError)) return false;
  }
  return true;
}

std::string MemoryFileManager::expandingTilde(const std::string& path) {
  return path == "~" || path.starts_with("~/") ? "/home/somebody" + path.substr(1) : path;
}

}  // namespace vaelo
