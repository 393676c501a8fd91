// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/files/local_file_manager.h"

#include <fcntl.h>
#include <glib.h>
#include <linux/fs.h>
#include <sys/stat.h>
#include <unistd.h>

#include <cerrno>
#include <cstdio>

#include "host/drive/packages.h"
#include "host/drive/promise_file.h"
#include "host/files/file_copy.h"
#include "host/files/file_times.h"
#include "host/files/system_error.h"
#include "host/files/tree_walk.h"

namespace vaelo {

bool LocalFileManager::fileExistsAtPath(const std::string& path, bool* isDirectory) {
  struct stat info {};
  if (stat(path.c_str(), &info) != 0) return false;
  if (isDirectory) *isDirectory = S_ISDIR(info.st_mode);
  return true;
}

Result<FileAttributes> LocalFileManager::attributesOfItemAtPath(const std::string& path) {
  struct statx info {};
  if (statx(AT_FDCWD, path.c_str(), AT_SYMLINK_NOFOLLOW, STATX_BASIC_STATS | STATX_BTIME, &info) != 0) {
    return errorFromErrno(errno, path, false);
  }
  FileAttributes attributes;
  attributes.type = S_ISREG(info.stx_mode)   ? FileType::Regular
                    : S_ISDIR(info.stx_mode) ? FileType::Directory
                    : S_ISLNK(info.stx_mode) ? FileType::SymbolicLink
                                             : FileType::Other;
  attributes.size = Value(static_cast<std::uint64_t>(info.stx_size));
  attributes.modificationDate = dateOf(info.stx_mtime);
  if (info.stx_mask & STATX_BTIME) attributes.creationDate = dateOf(info.stx_btime);
  return attributes;
}

Result<std::string> LocalFileManager::destinationOfSymbolicLinkAtPath(const std::string& path) {
  char target[PATH_MAX];
  const ssize_t length = readlink(path.c_str(), target, sizeof target);
  if (length < 0) return errorFromErrno(errno, path, false);
  return std::string(target, static_cast<std::size_t>(length));
}

std::optional<Error> LocalFileManager::createDirectoryAtURL(const URL& url) {
  bool isDirectory = false;
  if (fileExistsAtPath(url.path(), &isDirectory)) {
    return isDirectory ? std::nullopt : std::optional(errorFromErrno(EEXIST, url.path(), true));
  }
  if (g_mkdir_with_parents(url.path().c_str(), 0777) != 0) return errorFromErrno(errno, url.path(), true);
  return std::nullopt;
}

std::optional<Error> LocalFileManager::removeItemAtURL(const URL& url) {
  const std::optional<std::string> physical = physicalPathOf(url.path());
  if (!physical) return errorFromErrno(ENOENT, url.path(), true);
  return removeTree(*physical);
}

std::optional<Error> LocalFileManager::moveItemAtURL(const URL& source, const URL& destination) {
  const std::optional<std::string> from = physicalPathOf(source.path());
  if (!from) return errorFromErrno(ENOENT, source.path(), true);
  const bool promised = *from != source.path();
  const auto failed = [&](int number) {
    Error error = errorFromErrno(number, number == EEXIST ? destination.path() : source.path(), true);
    error.userInfo[DestinationFilePathErrorKey] = Value(destination.path());
    return error;
  };
  // The name may also be taken by an item that is not downloaded.
  if (const auto taken = physicalPathOf(destination.path()); taken && *taken != *from) {
    struct stat a {};
    struct stat b {};
    const bool sameFile = lstat(taken->c_str(), &a) == 0 && lstat(from->c_str(), &b) == 0 && a.st_dev == b.st_dev &&
                          a.st_ino == b.st_ino && S_ISDIR(a.st_mode);
    if (!sameFile) return failed(EEXIST);
  }
  if (promised) return movePromise(*from, destination.path());
  if (renameat2(AT_FDCWD, from->c_str(), AT_FDCWD, destination.path().c_str(), RENAME_NOREPLACE) == 0) return std::nullopt;
  if (errno == EXDEV) return copyThenRemove(*from, destination.path());
  return failed(errno);
}

void LocalFileManager::enumerate(const URL& url, const std::vector<ResourceKey>&, unsigned options,
                                 const std::function<bool(const URL&)>& visit,
                                 const std::function<bool(const URL&, const Error&)>& onError) {
  walkTree(url, options, visit, onError);
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
