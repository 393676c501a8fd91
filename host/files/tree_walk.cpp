// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/files/tree_walk.h"

#include <dirent.h>
#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>

#include <algorithm>
#include <cerrno>
#include <memory>
#include <vector>

#include "host/drive/packages.h"
#include "host/drive/promise_file.h"
#include "host/files/system_error.h"
#include "host/support/unique_fd.h"

namespace vaelo {

namespace {

struct DirClose {
  void operator()(DIR* dir) const { closedir(dir); }
};
using DirPtr = std::unique_ptr<DIR, DirClose>;

constexpr int FolderFlags = O_RDONLY | O_DIRECTORY | O_NOFOLLOW | O_CLOEXEC;

struct Entry {
  std::string name;
  bool isFolder;
};

/// The names in an open folder, whose descriptor it takes; sets errno and answers nothing on failure.
std::optional<std::vector<Entry>> readEntries(UniqueFd folder) {
  const int fd = folder.get();
  DirPtr dir(fdopendir(fd));
  if (!dir) return std::nullopt;
  folder.release();
  std::vector<Entry> entries;
  errno = 0;
  while (const dirent* entry = readdir(dir.get())) {
    const std::string name = entry->d_name;
    if (name == "." || name == "..") continue;
    bool isFolder = entry->d_type == DT_DIR;
    if (entry->d_type == DT_UNKNOWN) {
      struct stat info {};
      isFolder = fstatat(fd, entry->d_name, &info, AT_SYMLINK_NOFOLLOW) == 0 && S_ISDIR(info.st_mode);
    }
    entries.push_back({name, isFolder});
  }
  if (errno != 0) return std::nullopt;
  std::sort(entries.begin(), entries.end(), [](const Entry& a, const Entry& b) { return a.name < b.name; });
  return entries;
}

class Walk {
 public:
  Walk(unsigned options, const std::function<bool(const URL&)>& visit,
       const std::function<bool(const URL&, const Error&)>& onError)
      : options_(options), visit_(visit), onError_(onError) {}

  bool below(const URL& folder, int depth) {
    const auto entries = readEntries(UniqueFd(open(folder.path().c_str(), depth == 0 ? FolderFlags & ~O_NOFOLLOW : FolderFlags)));
    if (!entries) return onError_(folder, errorFromErrno(errno, folder.path(), false));
    for (const Entry& entry : *entries) {
      std::string path = folder.path() + "/" + entry.name;
      if (isPromiseName(entry.name)) {
        const std::optional<std::string> logical = logicalNameOf(path);
        if (!logical) continue;
        path = *logical;
      } else if (entry.name.front() == '.' && (options_ & SkipsHiddenFiles)) {
        continue;
      }
      if (!visit_(URL(path, entry.isFolder))) return false;
      const bool skipsPackage = (options_ & SkipsPackageDescendants) && isPackageName(entry.name);
      // Deeper than any path can be is a sign of a file system that lies.
      constexpr int deepest = 2048;
      if (!entry.isFolder || (options_ & SkipsSubdirectoryDescendants) || skipsPackage || depth == deepest) continue;
      if (!below(URL(path, true), depth + 1)) return false;
    }
    return true;
  }

 private:
  unsigned options_;
  const std::function<bool(const URL&)>& visit_;
  const std::function<bool(const URL&, const Error&)>& onError_;
};

/// Empties the open folder; answers 0 or errno.
int emptyFolder(UniqueFd folder) {
  const int again = dup(folder.get());
  const UniqueFd keeper(again);
  const auto entries = readEntries(std::move(folder));
  if (!entries) return errno;
  for (const Entry& entry : *entries) {
    if (entry.isFolder) {
      UniqueFd child(openat(keeper.get(), entry.name.c_str(), FolderFlags));
      if (child) {
        if (const int failure = emptyFolder(std::move(child))) return failure;
      } else if (errno != ELOOP && errno != ENOTDIR) {
        return errno;
      }
    }
    if (unlinkat(keeper.get(), entry.name.c_str(), entry.isFolder ? AT_REMOVEDIR : 0) != 0 && errno != ENOENT) return errno;
  }
  return 0;
}

}  // namespace

void walkTree(const URL& url, unsigned options, const std::function<bool(const URL&)>& visit,
              const std::function<bool(const URL&, const Error&)>& onError) {
  Walk(options, visit, onError).below(url, 0);
}

std::optional<Error> removeTree(const std::string& path) {
  struct stat info {};
  if (lstat(path.c_str(), &info) != 0) return errorFromErrno(errno, path, true);
  if (!S_ISDIR(info.st_mode)) {
    if (unlink(path.c_str()) != 0) return errorFromErrno(errno, path, true);
    return std::nullopt;
  }
  UniqueFd folder(open(path.c_str(), FolderFlags));
  if (!folder) return errorFromErrno(errno, path, true);
  if (const int failure = emptyFolder(std::move(folder))) return errorFromErrno(failure, path, true);
  if (rmdir(path.c_str()) != 0) return errorFromErrno(errno, path, true);
  return std::nullopt;
}

}  // namespace vaelo
