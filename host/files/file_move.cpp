// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/files/file_move.h"

#include <fcntl.h>
#include <linux/fs.h>
#include <sys/stat.h>
#include <unistd.h>

#include <cerrno>
#include <climits>
#include <cstdio>

#include "host/drive/promise_file.h"
#include "host/files/long_work.h"
#include "host/files/system_error.h"
#include "host/files/tree_copy.h"
#include "host/files/tree_removals.h"
#include "host/files/tree_walk.h"
#include "host/support/glib_ptr.h"
#include "host/support/texts.h"
#include "host/support/unique_fd.h"
#include "platform/url.h"

namespace vaelo {

namespace {

std::string folderOf(const std::string& path) { return URL(path).deletingLastPathComponent().path(); }

void flushTargetFolder(const std::string& path) {
  const UniqueFd folder(open(path.c_str(), O_RDONLY | O_DIRECTORY | O_CLOEXEC));
  if (folder) fsync(folder.get());
}

/// 0 or the error number.
int renameItem(const std::string& from, const std::string& to) {
  if (renameat2(AT_FDCWD, from.c_str(), AT_FDCWD, to.c_str(), RENAME_NOREPLACE) == 0) return 0;
  if (errno != EINVAL) return errno;
  // Network file systems don't know the flag. A second name of a file fails where one is; a folder replaces an empty folder
  // at most, and never a file.
  struct stat info {};
  if (lstat(from.c_str(), &info) != 0) return errno;
  if (!S_ISDIR(info.st_mode)) return renameWithoutReplacing(from, to);
  if (lstat(to.c_str(), &info) == 0) return EEXIST;
  return rename(from.c_str(), to.c_str()) == 0 ? 0 : errno;
}

/// Whether it is the folder where the item was to go, and not the item, of which a person is to be told.
bool targetRefuses(int number, const std::string& from, const std::string& folder) {
  struct stat info {};
  if (number == ENOENT || number == ENOTDIR) {
    return lstat(from.c_str(), &info) == 0 && (stat(folder.c_str(), &info) != 0 || !S_ISDIR(info.st_mode));
  }
  if (number != EACCES && number != EPERM && number != EROFS) return false;
  const auto canChange = [](const std::string& path) {
    return faccessat(AT_FDCWD, path.c_str(), W_OK | X_OK, AT_EACCESS) == 0;
  };
  return !canChange(folder) && canChange(folderOf(from));
}

int copyThenRemove(const std::string& from, const std::string& to, TreeRemovals* removals, const TreeCopy::GoOn& goOn) {
  if (const int number = whyNotMovable(from, folderOf(to))) return number;
  char name[48];
  std::snprintf(name, sizeof name, "/.vaelo-move-%08x%08x", g_random_int(), g_random_int());
  const std::string temporary = folderOf(to) + name;
  TreeCopy copy(from, temporary, goOn);
  int number = copy.run();
  // What another program wrote meanwhile must not go with the source.
  if (number == 0 && !copy.sourceIsUnchanged()) number = EBUSY;
  if (number == 0) number = renameItem(temporary, to);
  if (number != 0) {
    removeTree(temporary);
    return number;
  }
  flushTargetFolder(folderOf(to));
  // The item is at its new place, whole; what is left of the old one is not a failure of the move.
  if (!removals || !copy.isFolder() || removals->remove(from, true) != 0) removeTree(from);
  return 0;
}

}  // namespace

Error moveError(int number, const std::string& from, const std::string& to) {
  const bool isOfName = number == EEXIST || number == ENAMETOOLONG || number == EILSEQ;
  const bool isOfTarget = !isOfName && targetRefuses(number, from, folderOf(to));
  Error error = describedError(number, isOfName ? to : isOfTarget ? folderOf(to) : from, FileAccess::Write);
  if (isOfTarget && (number == ENOENT || number == ENOTDIR)) {
    error.localizedDescription = filled(_("The folder “%s” doesn’t exist any more."),
                                        {takeString(g_filename_display_basename(folderOf(to).c_str()))});
  }
  if (number == EINVAL && URL(to).isInside(URL(from))) {
    error.localizedDescription = _("A folder can’t be moved into itself.");
  }
  error.userInfo[DestinationFilePathErrorKey] = Value(to);
  return error;
}

std::optional<Error> moveFile(const std::string& from, const std::string& to, TreeRemovals* removals, LongWork* longWork) {
  // A mount below the folder would otherwise make it a copy of itself without end.
  if (URL(to).isInside(URL(from))) return moveError(EINVAL, from, to);
  int number = renameItem(from, to);
  if (number == EXDEV) {
    const auto copies = [&](const TreeCopy::GoOn& goOn) { return copyThenRemove(from, to, removals, goOn); };
    number = longWork ? longWork->run(from, copies) : copies([] { return true; });
  }
  if (number != 0) return moveError(number, from, to);
  return std::nullopt;
}

std::optional<Error> movePromise(const std::string& promise, const std::string& to) {
  const std::string target = promisePathFor(to);
  const auto nameOf = [](const std::string& path) { return path.substr(path.rfind('/') + 1); };
  // The promise could be written, but never the item.
  if (nameOf(to).size() > NAME_MAX) return moveError(ENAMETOOLONG, promise, to);
  if (logicalNameOfShortPromise(nameOf(promise)) && logicalNameOfShortPromise(nameOf(target))) {
    std::optional<Error> error = moveFile(promise, target);
    if (error) error->userInfo[DestinationFilePathErrorKey] = Value(to);
    return error;
  }
  // A long name stands inside the file, so that has to be written anew.
  Result<PromiseInfo> info = readPromise(promise);
  std::optional<Error> error = info.error;
  if (info) {
    info.value->name = nameOf(to);
    error = writePromise(folderOf(to), *info.value);
  }
  if (error) {
    error->userInfo[DestinationFilePathErrorKey] = Value(to);
    return error;
  }
  if (unlink(promise.c_str()) != 0) return moveError(errno, promise, to);
  return std::nullopt;
}

}  // namespace vaelo
