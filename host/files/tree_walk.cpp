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
  if (!folder) return std::nullopt;
  const int fd = folder.get();
  DirPtr dir(fdopendir(fd));
  if (!dir) return std::nullopt;
  folder.release();
  std::vector<Entry> entries;
  for (;;) {
    errno = 0;
    const dirent* entry = readdir(dir.get());
    if (!entry) break;
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

  /// False when a callback ended the walk.
  bool below(const URL& folder, const UniqueFd& open) {
    // A second descriptor, since reading takes one and the folders below are opened from the first: whatever somebody puts
    // in place of a folder above, the walk stays in the tree where it began.
    const auto entries = open ? readEntries(UniqueFd(openat(open.get(), ".", FolderFlags))) : std::nullopt;
    if (!entries) return onError_(folder, describedError(errno, folder.path(), FileAccess::Read));
    for (const Entry& entry : *entries) {
      const std::optional<std::string> name = logicalName(folder, entry, *entries);
      if (!name || (name->front() == '.' && (options_ & SkipsHiddenFiles))) continue;
      const URL url(folder.path() + "/" + *name, entry.isFolder);
      if (!visit_(url)) return false;
      if (!entry.isFolder || (options_ & SkipsSubdirectoryDescendants)) continue;
      if ((options_ & SkipsPackageDescendants) && isPackageName(entry.name)) continue;
      if (!below(url, UniqueFd(openat(open.get(), entry.name.c_str(), FolderFlags)))) return false;
    }
    return true;
  }

 private:
  /// Nothing for a promise that stands for no item, or for one that is there itself.
  static std::optional<std::string> logicalName(const URL& folder, const Entry& entry, const std::vector<Entry>& all) {
    if (entry.isFolder || !isPromiseName(entry.name)) return entry.name;
    const std::optional<std::string> path = logicalNameOf(folder.path() + "/" + entry.name);
    if (!path) return std::nullopt;
    std::string name = path->substr(path->rfind('/') + 1);
    const auto at =
        std::lower_bound(all.begin(), all.end(), name, [](const Entry& a, const std::string& b) { return a.name < b; });
    if (at != all.end() && at->name == name) return std::nullopt;
    return name;
  }

  unsigned options_;
  const std::function<bool(const URL&)>& visit_;
  const std::function<bool(const URL&, const Error&)>& onError_;
};

/// Opens a folder to empty it. One of ours may lack the permission, which its owner can give.
UniqueFd openToEmpty(int parent, const std::string& name) {
  UniqueFd folder(openat(parent, name.c_str(), FolderFlags));
  if (!folder && errno == EACCES) {
    if (fchmodat(parent, name.c_str(), S_IRWXU, 0) == 0) {
      folder = UniqueFd(openat(parent, name.c_str(), FolderFlags));
    } else {
      errno = EACCES;
    }
  }
  return folder;
}

/// 0 or errno.
int removeEntry(int parent, const std::string& name, int flags) {
  if (unlinkat(parent, name.c_str(), flags) == 0) return 0;
  if (errno != EACCES || fchmod(parent, S_IRWXU) != 0) return errno;
  return unlinkat(parent, name.c_str(), flags) == 0 ? 0 : errno;
}

/// Empties the open folder; answers 0 or errno.
int emptyFolder(UniqueFd folder, const std::function<bool()>& goOn) {
  const UniqueFd keeper(dup(folder.get()));
  if (!keeper) return errno;
  const auto entries = readEntries(std::move(folder));
  if (!entries) return errno;
  for (const Entry& entry : *entries) {
    if (!goOn()) return ECANCELED;
    if (entry.isFolder) {
      UniqueFd child = openToEmpty(keeper.get(), entry.name);
      if (child) {
        if (const int failure = emptyFolder(std::move(child), goOn)) return failure;
      } else if (errno != ELOOP && errno != ENOTDIR) {
        return errno;
      }
    }
    int number = removeEntry(keeper.get(), entry.name, entry.isFolder ? AT_REMOVEDIR : 0);
    // Somebody put a file or a link in the folder's place.
    if (number == ENOTDIR) number = removeEntry(keeper.get(), entry.name, 0);
    if (number != 0 && number != ENOENT) return number;
  }
  return 0;
}

void countBelow(UniqueFd folder, const std::function<bool()>& goOn, std::size_t& count) {
  const UniqueFd keeper(dup(folder.get()));
  const auto entries = keeper ? readEntries(std::move(folder)) : std::nullopt;
  if (!entries) return;
  for (const Entry& entry : *entries) {
    if (!goOn()) return;
    ++count;
    if (entry.isFolder) countBelow(UniqueFd(openat(keeper.get(), entry.name.c_str(), FolderFlags)), goOn, count);
  }
}

}  // namespace

void enumerateTree(const URL& url, unsigned options, const std::function<bool(const URL&)>& visit,
                   const std::function<bool(const URL&, const Error&)>& onError) {
  // Only the folder that was asked for may be named by a link.
  Walk(options, visit, onError).below(url, UniqueFd(open(url.path().c_str(), O_RDONLY | O_DIRECTORY | O_CLOEXEC)));
}

std::optional<Error> removeTree(const std::string& path) {
  const int number = removeTreeWhile(path, [] { return true; });
  if (number != 0) return describedError(number, path, FileAccess::Write);
  return std::nullopt;
}

int removeTreeWhile(const std::string& path, const std::function<bool()>& goOn) {
  struct stat info {};
  if (lstat(path.c_str(), &info) != 0) return errno;
  if (!goOn()) return ECANCELED;
  if (!S_ISDIR(info.st_mode)) return unlink(path.c_str()) == 0 ? 0 : errno;
  UniqueFd folder = openToEmpty(AT_FDCWD, path);
  if (!folder) return errno;
  if (const int number = emptyFolder(std::move(folder), goOn)) return number;
  return rmdir(path.c_str()) == 0 ? 0 : errno;
}

std::size_t countTree(const std::string& path, const std::function<bool()>& goOn) {
  std::size_t count = 1;
  countBelow(UniqueFd(open(path.c_str(), FolderFlags)), goOn, count);
  return count;
}

}  // namespace vaelo
