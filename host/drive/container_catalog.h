// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <cstdint>
#include <map>
#include <mutex>
#include <string>
#include <vector>

#include "host/drive/cloud_container.h"

namespace vaelo {

/// The containers of the mirror. Cheap enough for the main thread: what was read is kept until the file status of the
/// mirror, a container or its manifest changes, so a call costs three of them for each container. Safe from any thread.
class ContainerCatalog {
 public:
  /// All outlive it and the containers.
  ContainerCatalog(const DriveLayout& layout, LogSink& log, TreeRemovals& removals)
      : layout_(layout), log_(log), removals_(removals) {}

  /// Null when there is none.
  CloudContainerRef container(const std::string& identifier);
  /// Those with a documents folder, the default one first, the others in the order of their localized names.
  std::vector<CloudContainerRef> all();

 private:
  /// What tells that a file or folder is as it was.
  struct Stamp {
    std::uint64_t inode = 0;
    std::int64_t changed = 0;  ///< nanoseconds since 1970
    bool settled = false;      ///< old enough for a later change to show in `changed`
  };
  struct Entry {
    CloudContainerRef container;
    Stamp folder;
    Stamp manifest;
  };
  static Stamp stampOf(const std::string& path);
  static bool isUnchanged(const Stamp& before, const Stamp& now);
  CloudContainerRef containerLocked(const std::string& identifier);

  const DriveLayout& layout_;
  LogSink& log_;
  TreeRemovals& removals_;
  std::mutex mutex_;
  std::map<std::string, Entry> entries_;  // guarded by mutex_
  std::vector<std::string> identifiers_;  // guarded by mutex_
  Stamp mirror_;                          // guarded by mutex_; of when identifiers_ was read
};

}  // namespace vaelo
