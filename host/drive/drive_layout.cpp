// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/drive/drive_layout.h"

#include <fcntl.h>
#include <limits.h>
#include <linux/openat2.h>
#include <sys/syscall.h>
#include <unistd.h>

#include <algorithm>
#include <vector>

namespace vaelo {

namespace {

// As many as the kernel follows.
constexpr int linkLimit = 40;

bool isUsable(const std::string& path) {
  return !path.empty() && path.front() == '/' && path.find('\0') == std::string::npos;
}

std::vector<std::string> components(const std::string& path) {
  std::vector<std::string> parts;
  for (std::size_t start = 0; start < path.size();) {
    const std::size_t end = std::min(path.find('/', start), path.size());
    if (end > start) parts.push_back(path.substr(start, end - start));
    start = end + 1;
  }
  return parts;
}

std::string parent(const std::string& folder) { return folder.substr(0, folder.rfind('/')); }

std::optional<std::string> linkTarget(const std::string& path) {
  char target[PATH_MAX];
  const ssize_t length = ::readlink(path.c_str(), target, sizeof target);
  if (length <= 0) return std::nullopt;
  return std::string(target, static_cast<std::size_t>(length));
}

// Where `name` in the real folder `from` leads; "" stands for the root. Nothing for a circle.
std::optional<std::string> follow(const std::string& from, const std::string& name) {
  std::string place = from;
  std::vector<std::string> pending = {name};  // the next component last
  int links = 0;
  while (!pending.empty()) {
    std::string next;
    next.swap(pending.back());
    pending.pop_back();
    if (next == ".") continue;
    if (next == "..") {
      place = parent(place);
      continue;
    }
    const std::optional<std::string> target = linkTarget(place + "/" + next);
    if (!target) {
      place += "/" + next;
      continue;
    }
    if (++links > linkLimit) return std::nullopt;
    if (target->front() == '/') place.clear();
    const std::vector<std::string> parts = components(*target);
    pending.insert(pending.end(), parts.rbegin(), parts.rend());
  }
  return place;
}

// Asks the kernel in one go, since nearly no path has a link in it. Also false for what is not there and on kernels
// before 5.6.
bool hasNoLinks(const std::string& path) {
  open_how how = {};
  how.flags = O_PATH | O_CLOEXEC;
  how.resolve = RESOLVE_NO_SYMLINKS;
  const long handle = ::syscall(SYS_openat2, AT_FDCWD, path.c_str(), &how, sizeof how);
  if (handle < 0) return false;
  ::close(static_cast<int>(handle));
  return true;
}

bool isPlain(const std::string& path) {
  return path.find("//") == std::string::npos && path.find("/.") == std::string::npos && path.back() != '/';
}

}  // namespace

std::string realLocation(const std::string& path) {
  if (!isUsable(path)) return path;
  if (isPlain(path) && hasNoLinks(path)) return path;
  std::string place;
  for (const std::string& name : components(path)) {
    const std::optional<std::string> next = follow(place, name);
    place = next ? *next : place + "/" + name;
  }
  return place.empty() ? "/" : place;
}

DriveLayout::DriveLayout(const std::string& dataFolder)
    : dataFolder_(realLocation(dataFolder)), mirrorRoot_(realLocation(dataFolder_ + "/" + FirstMirror)) {}

void DriveLayout::setMirror(const std::string& folder) {
  std::string place = realLocation(dataFolder_ + "/" + folder);
  const std::unique_lock lock(mutex_);
  mirrorRoot_ = std::move(place);
}

std::string DriveLayout::mirrorRoot() const {
  const std::shared_lock lock(mutex_);
  return mirrorRoot_;
}

std::optional<std::string> DriveLayout::relativeToMirror(const std::string& path) const {
  if (!isUsable(path)) return std::nullopt;
  const std::string place = realLocation(path);
  const std::string mirror = mirrorRoot();
  if (place == mirror) return std::string();
  if (place.compare(0, mirror.size(), mirror) != 0 || place[mirror.size()] != '/') return std::nullopt;
  return place.substr(mirror.size() + 1);
}

bool DriveLayout::isInMirror(const std::string& path) const { return relativeToMirror(path).has_value(); }

bool DriveLayout::isInTrash(const std::string& path) const {
  const std::optional<std::string> relative = relativeToMirror(path);
  return relative && relative->substr(0, relative->find('/')) == ".Trash";
}

std::optional<std::string> DriveLayout::containerOf(const std::string& path) const {
  const std::optional<std::string> relative = relativeToMirror(path);
  if (!relative || relative->empty() || relative->front() == '.') return std::nullopt;
  return relative->substr(0, relative->find('/'));
}

}  // namespace vaelo
