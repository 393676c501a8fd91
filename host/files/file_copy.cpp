// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/files/file_copy.h"

#include <fcntl.h>
#include <glib.h>
#include <linux/fs.h>
#include <sys/sendfile.h>
#include <sys/stat.h>
#include <sys/xattr.h>
#include <unistd.h>

#include <cerrno>
#include <cstdio>
#include <filesystem>
#include <vector>

#include "host/drive/promise_file.h"
#include "host/files/system_error.h"
#include "host/files/tree_walk.h"
#include "host/support/unique_fd.h"
#include "platform/url.h"

namespace vaelo {

namespace {

void copyAttributes(const std::string& from, const std::string& to) {
  std::vector<char> names(static_cast<std::size_t>(std::max<ssize_t>(llistxattr(from.c_str(), nullptr, 0), 0)));
  const ssize_t length = names.empty() ? 0 : llistxattr(from.c_str(), names.data(), names.size());
  for (ssize_t at = 0; at < length;) {
    const char* name = names.data() + at;
    at += static_cast<ssize_t>(std::char_traits<char>::length(name)) + 1;
    std::vector<char> value(static_cast<std::size_t>(std::max<ssize_t>(lgetxattr(from.c_str(), name, nullptr, 0), 0)));
    if (lgetxattr(from.c_str(), name, value.data(), value.size()) == static_cast<ssize_t>(value.size())) {
      lsetxattr(to.c_str(), name, value.data(), value.size(), 0);
    }
  }
}

/// 0 or errno.
int copyFile(const std::string& from, const std::string& to, const struct stat& info) {
  const UniqueFd in(open(from.c_str(), O_RDONLY | O_NOFOLLOW | O_CLOEXEC));
  const UniqueFd out(in ? open(to.c_str(), O_WRONLY | O_CREAT | O_EXCL | O_NOFOLLOW | O_CLOEXEC, info.st_mode & 07777) : -1);
  if (!in || !out) return errno;
  off_t copied = 0;
  while (copied < info.st_size) {
    const ssize_t step = sendfile(out.get(), in.get(), nullptr, static_cast<std::size_t>(info.st_size - copied));
    if (step < 0) return errno;
    if (step == 0) break;
    copied += step;
  }
  struct stat now {};
  // The file changed while it was copied: the copy is of no moment of it.
  if (fstat(in.get(), &now) != 0 || copied != now.st_size || now.st_mtim.tv_nsec != info.st_mtim.tv_nsec) return EBUSY;
  copyAttributes(from, to);
  const struct timespec times[2] = {info.st_atim, info.st_mtim};
  futimens(out.get(), times);
  return fsync(out.get()) == 0 ? 0 : errno;
}

/// 0 or errno.
int copyTree(const std::string& from, const std::string& to) {
  struct stat info {};
  if (lstat(from.c_str(), &info) != 0) return errno;
  if (S_ISREG(info.st_mode)) return copyFile(from, to, info);
  if (S_ISLNK(info.st_mode)) {
    char target[PATH_MAX];
    const ssize_t length = readlink(from.c_str(), target, sizeof target - 1);
    if (length < 0) return errno;
    target[length] = '\0';
    return symlink(target, to.c_str()) == 0 ? 0 : errno;
  }
  if (!S_ISDIR(info.st_mode)) return EINVAL;
  if (mkdir(to.c_str(), 0700) != 0) return errno;
  std::error_code failure;
  for (std::filesystem::directory_iterator entry(from, failure), end; !failure && entry != end; entry.increment(failure)) {
    if (const int number = copyTree(entry->path(), to + "/" + entry->path().filename().string())) return number;
  }
  if (failure) return failure.value();
  copyAttributes(from, to);
  chmod(to.c_str(), info.st_mode & 07777);
  const struct timespec times[2] = {info.st_atim, info.st_mtim};
  utimensat(AT_FDCWD, to.c_str(), times, 0);
  return 0;
}

Error failure(int number, const std::string& from, const std::string& to) {
  Error error = errorFromErrno(number, number == EEXIST ? to : from, true);
  error.userInfo[DestinationFilePathErrorKey] = Value(to);
  return error;
}

}  // namespace

std::optional<Error> copyThenRemove(const std::string& from, const std::string& to) {
  char* unique = g_strdup_printf("%s/.vaelo-move-%08x%08x", URL(to).deletingLastPathComponent().path().c_str(),
                                 g_random_int(), g_random_int());
  const std::string temporary = unique;
  g_free(unique);
  int number = copyTree(from, temporary);
  if (number == 0 &&
      renameat2(AT_FDCWD, temporary.c_str(), AT_FDCWD, to.c_str(), RENAME_NOREPLACE) != 0) {
    number = errno;
  }
  if (number != 0) {
    removeTree(temporary);
    return failure(number, from, to);
  }
  const UniqueFd folder(open(URL(to).deletingLastPathComponent().path().c_str(), O_RDONLY | O_DIRECTORY | O_CLOEXEC));
  if (folder) fsync(folder.get());
  return removeTree(from);
}

std::optional<Error> movePromise(const std::string& promise, const std::string& to) {
  Result<PromiseInfo> info = readPromise(promise);
  if (!info.value) return info.error;
  info.value->name = URL(to).lastPathComponent();
  const std::string folder = URL(to).deletingLastPathComponent().path();
  if (auto error = writePromise(folder, *info.value)) return error;
  if (unlink(promise.c_str()) != 0) return failure(errno, promise, to);
  return std::nullopt;
}

}  // namespace vaelo
