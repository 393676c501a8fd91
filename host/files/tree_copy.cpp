// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/files/tree_copy.h"

#include <fcntl.h>
#include <sys/sendfile.h>
#include <sys/statvfs.h>
#include <sys/xattr.h>
#include <unistd.h>

#include <algorithm>
#include <cerrno>
#include <climits>
#include <csignal>
#include <cstdint>
#include <cstring>
#include <filesystem>

#include "host/support/unique_fd.h"

namespace vaelo {

namespace {

/// Attributes that the destination can't keep are left behind, as every file manager does.
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

bool isSame(const struct stat& a, const struct stat& b) {
  return a.st_dev == b.st_dev && a.st_ino == b.st_ino && a.st_mode == b.st_mode && a.st_size == b.st_size &&
         a.st_mtim.tv_sec == b.st_mtim.tv_sec && a.st_mtim.tv_nsec == b.st_mtim.tv_nsec;
}

/// Whether a program has the open file open for writing: what it still writes would go with the file when that is removed.
bool isBeingWritten(int file) {
  // Should a writer come this very moment, the kernel's signal must be one that ends nobody.
  fcntl(file, F_SETSIG, SIGURG);
  if (fcntl(file, F_SETLEASE, F_RDLCK) != 0) return errno == EAGAIN;
  fcntl(file, F_SETLEASE, F_UNLCK);
  return false;
}

int copyLink(const std::string& from, const std::string& to) {
  char target[PATH_MAX];
  const ssize_t length = readlink(from.c_str(), target, sizeof target - 1);
  if (length < 0) return errno;
  target[length] = '\0';
  return symlink(target, to.c_str()) == 0 ? 0 : errno;
}

/// What an item and all below it ask of the disk that they are to go to.
struct Needs {
  std::uint64_t block;
  std::uint64_t bytes = 0;
  std::uint64_t entries = 0;

  /// 0, or why an item can't be read or removed.
  int add(const std::string& path) {
    struct stat info {};
    if (lstat(path.c_str(), &info) != 0) return errno;
    ++entries;
    const auto size = S_ISREG(info.st_mode) ? static_cast<std::uint64_t>(info.st_size) : 1;
    bytes += (size + block - 1) / block * block;
    if (S_ISREG(info.st_mode)) return faccessat(AT_FDCWD, path.c_str(), R_OK, AT_EACCESS) == 0 ? 0 : errno;
    if (!S_ISDIR(info.st_mode)) return 0;
    if (faccessat(AT_FDCWD, path.c_str(), R_OK | W_OK | X_OK, AT_EACCESS) != 0) return errno;
    std::error_code failure;
    for (std::filesystem::directory_iterator entry(path, failure), end; !failure && entry != end; entry.increment(failure)) {
      if (const int number = add(entry->path())) return number;
    }
    return failure.value();
  }
};

}  // namespace

int whyNotMovable(const std::string& from, const std::string& into) {
  const std::string source = from.substr(0, std::max<std::size_t>(from.rfind('/'), 1));
  for (const std::string& folder : {into, source}) {
    if (faccessat(AT_FDCWD, folder.c_str(), W_OK | X_OK, AT_EACCESS) != 0) return errno;
  }
  struct statvfs disk {};
  if (statvfs(into.c_str(), &disk) != 0) return errno;
  Needs needs{std::max<std::uint64_t>(disk.f_frsize, 1)};
  if (const int number = needs.add(from)) return number;
  // Some file systems have no fixed number of entries, and say 0.
  const bool tooMany = disk.f_files > 0 && disk.f_favail < needs.entries;
  return tooMany || needs.bytes / needs.block > disk.f_bavail ? ENOSPC : 0;
}

int TreeCopy::copy(const std::string& from, const std::string& to) {
  if (!goOn_()) return ECANCELED;
  struct stat info {};
  if (lstat(from.c_str(), &info) != 0) return errno;
  copied_.push_back({from, info});
  if (S_ISREG(info.st_mode)) return copyFile(from, to, info);
  if (S_ISLNK(info.st_mode)) return copyLink(from, to);
  if (S_ISDIR(info.st_mode)) return copyFolder(from, to, info);
  // Pipes, sockets and devices have nothing to copy.
  return EOPNOTSUPP;
}

/// 0 when both have the same bytes, else EIO or the error number.
int TreeCopy::compareContent(int one, int other) const {
  constexpr std::size_t block = 1 << 18;
  std::vector<char> first(block);
  std::vector<char> second(block);
  off_t at = 0;
  for (;;) {
    if (!goOn_()) return ECANCELED;
    const ssize_t length = pread(one, first.data(), block, at);
    if (length < 0) return errno;
    std::size_t have = 0;
    while (have < static_cast<std::size_t>(std::max<ssize_t>(length, 1))) {
      const ssize_t more = pread(other, second.data() + have, block - have, at + static_cast<off_t>(have));
      if (more < 0) return errno;
      if (more == 0) break;
      have += static_cast<std::size_t>(more);
    }
    if (have < static_cast<std::size_t>(length) || (length == 0 && have > 0)) return EIO;
    if (length == 0) return 0;
    if (std::memcmp(first.data(), second.data(), static_cast<std::size_t>(length)) != 0) return EIO;
    at += length;
  }
}

int TreeCopy::copyFile(const std::string& from, const std::string& to, const struct stat& info) {
  const UniqueFd in(open(from.c_str(), O_RDONLY | O_NOFOLLOW | O_NONBLOCK | O_CLOEXEC));
  if (!in) return errno;
  if (isBeingWritten(in.get())) return EBUSY;
  const UniqueFd out(open(to.c_str(), O_RDWR | O_CREAT | O_EXCL | O_NOFOLLOW | O_CLOEXEC, 0600));
  if (!out) return errno;
  for (;;) {
    if (!goOn_()) return ECANCELED;
    constexpr std::size_t most = 1 << 23;  // a fraction of a second's worth
    const ssize_t step = sendfile(out.get(), in.get(), nullptr, most);
    if (step == 0) break;
    if (step < 0 && errno != EINTR) return errno;
  }
  struct stat source {};
  struct stat made {};
  if (fstat(in.get(), &source) != 0 || fstat(out.get(), &made) != 0) return errno;
  // It changed while it was copied: the copy is of no moment of it.
  if (!isSame(info, source) || made.st_size != info.st_size) return EBUSY;
  copyAttributes(from, to);
  const struct timespec times[2] = {info.st_atim, info.st_mtim};
  if (fchmod(out.get(), info.st_mode & 07777) != 0 || futimens(out.get(), times) != 0 || fsync(out.get()) != 0) return errno;
  // What the disk has now, and not what memory has of it.
  posix_fadvise(out.get(), 0, 0, POSIX_FADV_DONTNEED);
  return compareContent(in.get(), out.get());
}

int TreeCopy::copyFolder(const std::string& from, const std::string& to, const struct stat& info) {
  if (mkdir(to.c_str(), 0700) != 0) return errno;
  std::error_code failure;
  for (std::filesystem::directory_iterator entry(from, failure), end; !failure && entry != end; entry.increment(failure)) {
    if (const int number = copy(entry->path(), to + "/" + entry->path().filename().string())) return number;
  }
  if (failure) return failure.value();
  copyAttributes(from, to);
  const UniqueFd made(open(to.c_str(), O_RDONLY | O_DIRECTORY | O_NOFOLLOW | O_CLOEXEC));
  const struct timespec times[2] = {info.st_atim, info.st_mtim};
  if (!made || fchmod(made.get(), info.st_mode & 07777) != 0 || futimens(made.get(), times) != 0 || fsync(made.get()) != 0) {
    return errno;
  }
  return 0;
}

bool TreeCopy::sourceIsUnchanged() const {
  return std::all_of(copied_.begin(), copied_.end(), [](const Copied& item) {
    struct stat now {};
    if (lstat(item.path.c_str(), &now) != 0 || !isSame(item.info, now)) return false;
    if (!S_ISREG(now.st_mode)) return true;
    const UniqueFd file(open(item.path.c_str(), O_RDONLY | O_NOFOLLOW | O_NONBLOCK | O_CLOEXEC));
    return file && !isBeingWritten(file.get());
  });
}

}  // namespace vaelo
