// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/gtk/list/folder_reader.h"

#include <dirent.h>
#include <fcntl.h>
#include <sys/stat.h>
#include <sys/syscall.h>
#include <unistd.h>

#include <cerrno>
#include <cstddef>
#include <cstring>
#include <optional>

#include "host/drive/packages.h"
#include "host/drive/promise_file.h"

namespace vaelo {
namespace {

/// As the kernel writes it; the C library has no declaration for it.
struct KernelEntry {
  std::uint64_t inode;
  std::int64_t next;
  std::uint16_t length;
  std::uint8_t type;
  char name[1];
};

/// Calls `visit(name, type)` for each entry; false with errno set when the folder can't be read. The large buffer makes
/// 100,000 names some 15 system calls.
template <typename Visit>
bool forEachEntry(int folder, Visit visit) {
  std::vector<char> buffer(256 * 1024);
  while (true) {
    const long count = syscall(SYS_getdents64, folder, buffer.data(), buffer.size());
    if (count < 0) return false;
    if (count == 0) return true;
    for (long offset = 0; offset < count;) {
      const char* at = buffer.data() + offset;
      std::uint16_t length;
      std::memcpy(&length, at + offsetof(KernelEntry, length), sizeof length);
      visit(at + offsetof(KernelEntry, name), static_cast<unsigned char>(at[offsetof(KernelEntry, type)]));
      offset += length;
    }
  }
}

/// What stands at `name`, which is no promise file.
std::optional<EntryKind> kindAt(int folder, const char* name) {
  struct stat status;
  if (fstatat(folder, name, &status, AT_SYMLINK_NOFOLLOW) != 0) return std::nullopt;
  if (!S_ISLNK(status.st_mode)) return kindOfName(name, S_ISDIR(status.st_mode));
  const bool toFolder = fstatat(folder, name, &status, 0) == 0 && S_ISDIR(status.st_mode);
  return toFolder && !isPackageName(name) ? EntryKind::FolderLink : EntryKind::Symlink;
}

EntryKind promisedKind(std::string_view name) {
  return isPackageName(name) ? EntryKind::PromisedPackage : EntryKind::Promise;
}

}  // namespace

FolderReading readFolder(const std::string& path) {
  const int folder = open(path.c_str(), O_RDONLY | O_DIRECTORY | O_CLOEXEC);
  if (folder < 0) return {nullptr, errno};
  FolderSnapshot::Draft draft;
  const bool read = forEachEntry(folder, [&](const char* name, unsigned char type) {
    if (name[0] == '.') {
      if (!isPromiseName(name)) return;
      std::optional<std::string> logical = logicalNameOfShortPromise(name);
      if (!logical) logical = logicalNameOf(path + "/" + name);
      // Where the long form gives a path, its last component is the name.
      if (logical) {
        const std::string_view item = std::string_view(*logical).substr(logical->rfind('/') + 1);
        if (!item.empty() && item[0] != '.') draft.add(item, promisedKind(item));
      }
      return;
    }
    if (type == DT_REG || type == DT_DIR) {
      draft.add(name, kindOfName(name, type == DT_DIR));
    } else if (const auto kind = kindAt(folder, name)) {
      draft.add(name, *kind);
    }
  });
  const int errorNumber = read ? 0 : errno;
  close(folder);
  if (!read) return {nullptr, errorNumber};
  return {FolderSnapshot::sorted(std::move(draft)), 0};
}

std::vector<EntryChange> lookUpNames(const std::string& path, const std::vector<std::string>& names) {
  std::vector<EntryChange> changes;
  changes.reserve(names.size());
  const int folder = open(path.c_str(), O_PATH | O_DIRECTORY | O_CLOEXEC);
  for (const std::string& name : names) {
    EntryChange change{name, std::nullopt};
    if (folder >= 0) {
      change.kind = kindAt(folder, name.c_str());
      if (!change.kind && faccessat(folder, promiseNameFor(name).c_str(), F_OK, AT_SYMLINK_NOFOLLOW) == 0) {
        change.kind = promisedKind(name);
      }
    }
    changes.push_back(std::move(change));
  }
  if (folder >= 0) close(folder);
  return changes;
}

long countEntries(int folder, const char* name) {
  const int child = openat(folder, name, O_RDONLY | O_DIRECTORY | O_CLOEXEC);
  if (child < 0) return -1;
  long count = 0;
  const bool read = forEachEntry(child, [&](const char* entry, unsigned char) {
    if (entry[0] != '.' || isPromiseName(entry)) ++count;
  });
  close(child);
  return read ? count : -1;
}

}  // namespace vaelo
