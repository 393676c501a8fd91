// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <sys/stat.h>

#include <chrono>
#include <map>
#include <memory>
#include <optional>
#include <set>
#include <string>
#include <vector>

#include "host/support/unique_fd.h"

namespace vaelo {

/// What happened to an item since it was last asked.
struct ItemNews {
  bool changed = false;
  std::optional<std::string> movedTo;  ///< the logical path where it is now
  bool deleted = false;
  std::vector<std::string> deletedInside;  ///< paths of what a folder held
  bool any() const { return changed || movedTo || deleted || !deletedInside.empty(); }
};

/// One file or folder that somebody shows: remembers how it was seen last, and tells by looking at the disk what happened to
/// it. The item is its inode while nothing stands at its path, and the path while something does: an editor that saves under
/// a new name and renames changes the document, and does not delete it. A promise and the document it stands for are one
/// item. Not synchronised.
class WatchedItem {
 public:
  using Clock = std::chrono::steady_clock;
  /// For how long nothing may stand at the path before the item counts as moved or deleted.
  static constexpr std::chrono::milliseconds Patience{400};

  /// `path` is logical or a promise's own.
  explicit WatchedItem(const std::string& path);

  const std::string& path() const { return path_; }
  std::string folder() const { return path_.substr(0, path_.rfind('/')); }
  bool isFolder() const { return seen_ && S_ISDIR(seen_->type); }
  /// A name in its own folder that says something about the item.
  bool concerns(const std::string& name) const { return name == name_ || name == promiseName_; }

  // What a folder's monitor saw in it; the paths are absolute. A look judges them.
  void sawInside() { inside_ = true; }
  void sawRemoval(const std::string& path);
  void sawArrival(const std::string& path);

  /// Looks at the disk. When it answers nothing though something seems to be gone, `lookAgainAt` is when to look once more.
  ItemNews look(Clock::time_point now);
  const std::optional<Clock::time_point>& lookAgainAt() const { return lookAgainAt_; }

  // What somebody else has told already.
  void takeAsKnown();
  void followTo(const std::string& path);
  void takeDeletionAsTold() { deletionTold_ = true; }

 private:
  struct Seen {
    dev_t device = 0;
    ino_t inode = 0;
    mode_t type = 0;
    off_t size = 0;
    timespec modified = {};
    std::string tags;  // the attribute, as it is kept
    bool isSameAs(const Seen& other) const;
  };
  void setPath(const std::string& path);
  std::optional<Seen> see(UniqueFd* held) const;
  std::optional<std::string> placeOfHeld() const;
  void lookForLost(Clock::time_point now, ItemNews& news);
  void lookInside(Clock::time_point now, ItemNews& news);

  std::string path_;
  std::string name_;
  std::string promiseName_;
  std::optional<Seen> seen_;
  UniqueFd held_;  // keeps the inode from being given to another file, and knows where it is
  std::optional<Clock::time_point> lostAt_;
  std::optional<Clock::time_point> lookAgainAt_;
  bool deletionTold_ = false;
  bool ended_ = false;
  bool inside_ = false;
  std::map<std::string, std::optional<Clock::time_point>> removed_;  // inside, with the time of the first look
  std::set<std::string> arrived_;                                    // inside, since the last look
};

}  // namespace vaelo
