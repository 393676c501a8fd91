// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/files/local_file_manager.h"

#include <fcntl.h>
#include <glib.h>
#include <linux/fs.h>
#include <sys/stat.h>
#include <unistd.h>

#include <cerrno>
#include <climits>
#include <cstdio>

#include "host/drive/item_attributes.h"
#include "host/drive/promise_file.h"
#include "host/files/file_move.h"
#include "host/files/file_times.h"
#include "host/files/long_work.h"
#include "host/files/system_error.h"
#include "host/files/tree_walk.h"

namespace vaelo {

namespace {

/// One directory entry under two spellings. Two names of a file (hard links) are two items.
bool isSameItem(const std::string& a, const std::string& b) {
  struct stat first {};
  struct stat second {};
  return lstat(a.c_str(), &first) == 0 && lstat(b.c_str(), &second) == 0 && first.st_dev == second.st_dev &&
         first.st_ino == second.st_ino && (S_ISDIR(first.st_mode) || first.st_nlink == 1);
}

/// Renames what stands on the disk itself to a name that nobody has: the case of nearly every move, of which there may be
/// thousands, with as few looks at the disk as it takes. False for all else, and nothing is changed then.
bool renamePlainly(const URL& source, const std::string& to, const NameRules& rules) {
  if (rules.foldAny() || isPromiseName(source.lastPathComponent())) return false;
  struct stat info {};
  if (lstat(promisePathFor(to).c_str(), &info) == 0 || errno != ENOENT) return false;
  return renameat2(AT_FDCWD, source.path().c_str(), AT_FDCWD, to.c_str(), RENAME_NOREPLACE) == 0;
}

}  // namespace

bool LocalFileManager::fileExistsAtPath(const std::string& path, bool* isDirectory) {
  struct stat info {};
  const bool exists = stat(path.c_str(), &info) == 0;
  if (isDirectory) *isDirectory = exists && S_ISDIR(info.st_mode);
  return exists;
}

Result<FileAttributes> LocalFileManager::attributesOfItemAtPath(const std::string& path) {
  struct statx info {};
  if (statx(AT_FDCWD, path.c_str(), AT_SYMLINK_NOFOLLOW, STATX_BASIC_STATS | STATX_BTIME, &info) != 0) {
    return describedError(errno, path, FileAccess::Read);
  }
  FileAttributes attributes;
  attributes.type = S_ISREG(info.stx_mode)   ? FileType::Regular
                    : S_ISDIR(info.stx_mode) ? FileType::Directory
                    : S_ISLNK(info.stx_mode) ? FileType::SymbolicLink
                                             : FileType::Other;
  attributes.size = Value(static_cast<std::uint64_t>(info.stx_size));
  attributes.modificationDate = dateOf(info.stx_mtime);
  if (info.stx_mask & STATX_BTIME) attributes.creationDate = dateOf(info.stx_btime);
  attributes.extensionHidden = extensionIsHiddenAt(path);
  return attributes;
}

Result<std::string> LocalFileManager::destinationOfSymbolicLinkAtPath(const std::string& path) {
  char target[PATH_MAX];
  const ssize_t length = readlink(path.c_str(), target, sizeof target);
  if (length < 0) return describedError(errno, path, FileAccess::Read);
  return std::string(target, static_cast<std::size_t>(length));
}

std::optional<Error> LocalFileManager::createDirectoryAtURL(const URL& url) {
  bool isDirectory = false;
  if (fileExistsAtPath(url.path(), &isDirectory) && isDirectory) return std::nullopt;
  // Also a link that leads nowhere, and an item that is not downloaded.
  if (physicalPathOf(url.path()) || clashingItem(url.path(), rules_)) {
    return describedError(EEXIST, url.path(), FileAccess::Write);
  }
  if (g_mkdir_with_parents(url.path().c_str(), 0777) != 0) return describedError(errno, url.path(), FileAccess::Write);
  return std::nullopt;
}

std::optional<Error> LocalFileManager::removeItemAtURL(const URL& url) {
  if (longWork_ && !longWork_->step(url.path(), LongWork::Kind::Removal)) {
    return describedError(ECANCELED, url.path(), FileAccess::Write);
  }
  const std::optional<std::string> physical = physicalPathOf(url.path());
  if (!physical) return describedError(ENOENT, url.path(), FileAccess::Write);
  struct stat info {};
  if (!removals_ || lstat(physical->c_str(), &info) != 0 || !S_ISDIR(info.st_mode)) return removeTree(*physical);
  if (const int number = removals_->remove(*physical)) return describedError(number, url.path(), FileAccess::Write);
  return std::nullopt;
}

std::optional<Error> LocalFileManager::moveItemAtURL(const URL& source, const URL& destination) {
  const std::string& to = destination.path();
  if (longWork_ && !longWork_->step(source.path(), LongWork::Kind::Move)) return moveError(ECANCELED, source.path(), to);
  if (renamePlainly(source, to, rules_)) return std::nullopt;
  const std::optional<std::string> from = physicalPathOf(source.path());
  if (!from) return moveError(ENOENT, source.path(), to);
  // The name may also be taken by an item that is not downloaded.
  if (const auto taken = physicalPathOf(to)) {
    if (!isSameItem(*from, *taken)) return moveError(EEXIST, source.path(), to);
    // A file system that does not tell case apart finds the item itself under its new name.
    if (rename(from->c_str(), taken->c_str()) != 0) return moveError(errno, source.path(), to);
    return std::nullopt;
  }
  // An item may change to another spelling of its own name.
  if (clashingItem(to, rules_, source.path())) return moveError(EEXIST, source.path(), to);
  return isPromiseName(URL(*from).lastPathComponent()) ? movePromise(*from, to) : moveFile(*from, to, removals_, longWork_);
}

void LocalFileManager::enumerate(const URL& url, const std::vector<ResourceKey>&, unsigned options,
                                 const std::function<bool(const URL&)>& visit,
                                 const std::function<bool(const URL&, const Error&)>& onError) {
  enumerateTree(url, options, visit, onError);
}

std::vector<std::string> LocalFileManager::userDocumentsDirectories() {
  const char* folder = g_get_user_special_dir(G_USER_DIRECTORY_DOCUMENTS);
  return {folder ? std::string(folder) : std::string("~/Documents")};
}

std::string LocalFileManager::expandingTilde(const std::string& path) {
  const bool own = path == "~" || path.compare(0, 2, "~/") == 0;
  return own ? g_get_home_dir() + path.substr(1) : path;
}

}  // namespace vaelo
