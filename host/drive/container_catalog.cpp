// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/drive/container_catalog.h"

#include <dirent.h>
#include <glib.h>
#include <sys/stat.h>

#include <algorithm>
#include <ctime>
#include <memory>
#include <tuple>

namespace vaelo {

namespace {

// Longer than a tick of the clock that the kernel stamps files with.
constexpr std::int64_t settlingTime = 50'000'000;

std::int64_t nanoseconds(const timespec& time) { return time.tv_sec * 1'000'000'000 + time.tv_nsec; }

std::vector<std::string> visibleNames(const std::string& folder) {
  std::vector<std::string> names;
  const std::unique_ptr<DIR, int (*)(DIR*)> stream(::opendir(folder.c_str()), ::closedir);
  if (!stream) return names;
  while (const dirent* entry = ::readdir(stream.get())) {
    if (entry->d_name[0] != '.') names.emplace_back(entry->d_name);
  }
  return names;
}

std::string sortKey(const std::string& name) {
  gchar* key = g_utf8_collate_key_for_filename(name.c_str(), -1);
  std::string text(key);
  g_free(key);
  return text;
}

}  // namespace

ContainerCatalog::Stamp ContainerCatalog::stampOf(const std::string& path) {
  timespec now = {};
  ::clock_gettime(CLOCK_REALTIME, &now);
  struct stat status = {};
  if (::lstat(path.c_str(), &status) != 0) return {0, 0, true};
  const std::int64_t changed = nanoseconds(status.st_ctim);
  return {status.st_ino, changed, nanoseconds(now) - changed > settlingTime};
}

bool ContainerCatalog::isUnchanged(const Stamp& before, const Stamp& now) {
  return before.settled && before.inode == now.inode && before.changed == now.changed;
}

CloudContainerRef ContainerCatalog::container(const std::string& identifier) {
  const std::lock_guard lock(mutex_);
  return containerLocked(identifier);
}

CloudContainerRef ContainerCatalog::containerLocked(const std::string& identifier) {
  const std::string folder = layout_.containerFolder(identifier);
  const Stamp folderNow = stampOf(folder);
  const Stamp manifestNow = stampOf(folder + "/" + ContainerManifestName);
  const auto known = entries_.find(identifier);
  if (known != entries_.end() && isUnchanged(known->second.folder, folderNow) &&
      isUnchanged(known->second.manifest, manifestNow)) {
    return known->second.container;
  }
  CloudContainerRef read = LocalContainer::read(layout_, identifier, log_, removals_);
  if (read) {
    entries_[identifier] = {read, folderNow, manifestNow};
  } else {
    entries_.erase(identifier);
  }
  return read;
}

std::vector<CloudContainerRef> ContainerCatalog::all() {
  const std::lock_guard lock(mutex_);
  const Stamp now = stampOf(layout_.mirrorRoot());
  if (!isUnchanged(mirror_, now)) {
    identifiers_ = visibleNames(layout_.mirrorRoot());
    mirror_ = now;
  }
  using Sortable = std::tuple<bool, std::string, std::string, CloudContainerRef>;
  std::vector<Sortable> found;
  for (const std::string& identifier : identifiers_) {
    CloudContainerRef read = containerLocked(identifier);
    if (!read || !read->documentsFolderURL()) continue;
    const bool isDefault = identifier == DriveLayout::DefaultContainer;
    found.emplace_back(!isDefault, sortKey(read->localizedName()), identifier, std::move(read));
  }
  std::sort(found.begin(), found.end());
  std::vector<CloudContainerRef> containers;
  for (const Sortable& each : found) containers.push_back(std::get<3>(each));
  return containers;
}

}  // namespace vaelo
