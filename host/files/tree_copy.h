// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <sys/stat.h>

#include <functional>
#include <string>
#include <vector>

namespace vaelo {

/// Why `from` can't be copied into the folder `into` and then be removed, as far as that can be told before: 0 or EACCES,
/// EROFS, ENOSPC, or another error number. Looks at every item; blocks.
int whyNotMovable(const std::string& from, const std::string& into);

/// Copies an item and all below it with attributes, modes and times; links are copied as links. Every file and folder is
/// flushed, and what a file's copy has on the disk is compared with the file. Blocks; one thread.
class TreeCopy {
 public:
  using GoOn = std::function<bool()>;

  /// Nothing may stand at `to`. `goOn` is asked many times a second.
  TreeCopy(
      std::string from, std::string to, GoOn goOn = [] { return true; })
      : from_(std::move(from)), to_(std::move(to)), goOn_(std::move(goOn)) {}
  /// 0 or the error number, after which a part of the copy may be there. EBUSY: the source changed meanwhile, or a program
  /// holds a file of it open for writing; EIO: the disk gave back something else than it was given; ECANCELED: it was told
  /// to end.
  int run() { return copy(from_, to_); }
  bool isFolder() const { return !copied_.empty() && S_ISDIR(copied_.front().info.st_mode); }
  /// True while everything that run() copied is still as it was, and no program can write to it unseen.
  bool sourceIsUnchanged() const;

 private:
  struct Copied {
    std::string path;
    struct stat info;
  };
  int copy(const std::string& from, const std::string& to);
  int compareContent(int one, int other) const;
  int copyFile(const std::string& from, const std::string& to, const struct stat& info);
  int copyFolder(const std::string& from, const std::string& to, const struct stat& info);

  std::string from_;
  std::string to_;
  GoOn goOn_;
  std::vector<Copied> copied_;
};

}  // namespace vaelo
