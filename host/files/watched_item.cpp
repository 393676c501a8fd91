// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/files/watched_item.h"

#include <fcntl.h>
#include <limits.h>
#include <unistd.h>

#include <algorithm>
#include <utility>

#include "host/drive/extended_attribute.h"
#include "host/drive/item_attributes.h"
#include "host/drive/promise_file.h"

namespace vaelo {

namespace {

constexpr std::size_t mostRemovals = 64;  // that are told one by one

std::string lastComponent(const std::string& path) { return path.substr(path.rfind('/') + 1); }

bool isThere(const std::string& path) {
  struct stat status = {};
  return ::lstat(path.c_str(), &status) == 0;
}

}  // namespace

bool WatchedItem::Seen::isSameAs(const Seen& other) const {
  if (device != other.device || inode != other.inode || type != other.type || tags != other.tags) return false;
  // A folder's own times say less than what is seen in it.
  return S_ISDIR(type) ||
         (size == other.size && modified.tv_sec == other.modified.tv_sec && modified.tv_nsec == other.modified.tv_nsec);
}

WatchedItem::WatchedItem(const std::string& path) {
  setPath(logicalNameOf(path).value_or(path));
  seen_ = see(&held_);
}

void WatchedItem::setPath(const std::string& path) {
  path_ = path;
  name_ = lastComponent(path);
  promiseName_ = promiseNameFor(name_);
}

std::optional<WatchedItem::Seen> WatchedItem::see(UniqueFd* held) const {
  const std::optional<std::string> physical = physicalPathOf(path_);
  if (!physical) return std::nullopt;
  UniqueFd file(::open(physical->c_str(), O_PATH | O_NOFOLLOW | O_CLOEXEC));
  struct stat status = {};
  if (!file || ::fstat(file.get(), &status) != 0) return std::nullopt;
  *held = std::move(file);
  return Seen{status.st_dev,  status.st_ino,  status.st_mode & S_IFMT,
              status.st_size, status.st_mtim, extendedAttribute(*physical, TagsAttribute).value_or("")};
}

// The kernel knows the name under which a file was opened also after that was changed, or one of the folders above it.
std::optional<std::string> WatchedItem::placeOfHeld() const {
  if (!held_) return std::nullopt;
  char place[PATH_MAX];
  const std::string link = "/proc/self/fd/" + std::to_string(held_.get());
  const ssize_t length = ::readlink(link.c_str(), place, sizeof place);
  if (length <= 0 || place[0] != '/') return std::nullopt;
  std::string path(place, static_cast<std::size_t>(length));
  // A deleted one is named too, with a remark; that a file has such a name does not help.
  struct stat there = {};
  if (::lstat(path.c_str(), &there) != 0 || there.st_dev != seen_->device || there.st_ino != seen_->inode)
    return std::nullopt;
  return logicalNameOf(path).value_or(path);
}

void WatchedItem::sawRemoval(const std::string& path) {
  inside_ = true;
  // What is hidden is somebody's working file, and so is what came only now.
  if (lastComponent(path).front() == '.' || arrived_.erase(path) || removed_.size() >= mostRemovals) return;
  removed_.emplace(path, std::nullopt);
}

void WatchedItem::sawArrival(const std::string& path) {
  inside_ = true;
  if (!removed_.erase(path) && arrived_.size() < mostRemovals) arrived_.insert(path);
}

ItemNews WatchedItem::look(Clock::time_point now) {
  ItemNews news;
  lookAgainAt_.reset();
  if (ended_) return news;
  UniqueFd held;
  const std::optional<Seen> seen = see(&held);
  if (!seen) {
    lookForLost(now, news);
    return news;
  }
  lostAt_.reset();
  const bool changedInside = std::exchange(inside_, false);
  news.changed = !seen_ || !seen->isSameAs(*seen_) || changedInside;
  seen_ = seen;
  held_ = std::move(held);
  lookInside(now, news);
  return news;
}

void WatchedItem::lookForLost(Clock::time_point now, ItemNews& news) {
  if (!seen_) return;  // nobody has seen it yet, so that it can't be gone
  if (!lostAt_) lostAt_ = now;
  if (now < *lostAt_ + Patience) {
    lookAgainAt_ = *lostAt_ + Patience;
    return;
  }
  if (const std::optional<std::string> place = placeOfHeld()) {
    followTo(*place);
    news.movedTo = place;
    return;
  }
  ended_ = true;
  held_ = UniqueFd();  // which would keep the disk from being freed
  news.deleted = !deletionTold_;
}

void WatchedItem::lookInside(Clock::time_point now, ItemNews& news) {
  arrived_.clear();
  for (auto at = removed_.begin(); at != removed_.end();) {
    auto& [path, since] = *at;
    if (!since) since = now;
    if (isThere(path)) {
      at = removed_.erase(at);
    } else if (now >= *since + Patience) {
      news.deletedInside.push_back(path);
      at = removed_.erase(at);
    } else {
      lookAgainAt_ = std::min(lookAgainAt_.value_or(*since + Patience), *since + Patience);
      ++at;
    }
  }
}

void WatchedItem::takeAsKnown() {
  UniqueFd held;
  const std::optional<Seen> seen = see(&held);
  if (!seen) return;
  seen_ = seen;
  held_ = std::move(held);
}

void WatchedItem::followTo(const std::string& path) {
  setPath(path);
  lostAt_.reset();
  lookAgainAt_.reset();
  removed_.clear();
  arrived_.clear();
  takeAsKnown();
}

}  // namespace vaelo
