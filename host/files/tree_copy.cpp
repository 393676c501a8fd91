// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/files/tree_copy.h"

#include <fcntl.h>
#include <sys/sendfile.h>
#include <sys/xattr.h>
#include <unistd.h>

#include <algorithm>
#include <cerrno>
#include <climits>
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

int copyLink(const std::string& from, const std::string& to) {
  char target[PATH_MAX];
  const ssize_t length = readlink(from.c_str(), target, sizeof target - 1);
  if (length < 0) return errno;
  target[length] = '\0';
  return symlink(target, to.c_str()) == 0 ? 0 : errno;
}

}  // namespace

int TreeCopy::copy(const std::string& from, const std::string& to) {
  struct stat info {};
  if (lstat(from.c_str(), &info) != 0) return errno;
  copied_.push_back({from, info});
  if (S_ISREG(info.st_mode)) return copyFile(from, to, info);
  if (S_ISLNK(info.st_mode)) return copyLink(from, to);
  if (S_ISDIR(info.st_mode)) return copyFolder(from, to, info);
  // Pipes, sockets and devices have nothing to copy.
  return EOPNOTSUPP;
}

int TreeCopy::copyFile(const std::string& from, const std::string& to, const struct stat& info) {
  const UniqueFd in(open(from.c_str(), O_RDONLY | O_NOFOLLOW | O_NONBLOCK | O_CLOEXEC));
  if (!in) return errno;
  const UniqueFd out(open(to.c_str(), O_WRONLY | O_CREAT | O_EXCL | O_NOFOLLOW | O_CLOEXEC, 0600));
  if (!out) return errno;
  for (;;) {
    constexpr std::size_t most = 0x7ffff000;  // what one call transfers on Linux
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
  return 0;
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
    return lstat(item.path.c_str(), &now) == 0 && isSame(item.info, now);
  });
}

}  // namespace vaelo
