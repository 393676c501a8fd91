// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <sys/stat.h>

#include <optional>
#include <string>

namespace vaelo {

/// What tells one content of a file from another.
struct FileVersion {
  dev_t device = 0;
  ino_t number = 0;
  off_t size = -1;
  timespec modified = {};

  bool isSameFile(const FileVersion& other) const { return device == other.device && number == other.number; }
  bool operator==(const FileVersion& other) const {
    return isSameFile(other) && size == other.size && modified.tv_sec == other.modified.tv_sec &&
           modified.tv_nsec == other.modified.tv_nsec;
  }
};

inline FileVersion versionIn(const struct stat& status) {
  return {status.st_dev, status.st_ino, status.st_size, status.st_mtim};
}

inline std::optional<FileVersion> versionOf(int openFile) {
  struct stat status = {};
  return ::fstat(openFile, &status) == 0 ? std::optional(versionIn(status)) : std::nullopt;
}

/// Of what stands at the path; a final link is followed.
inline std::optional<FileVersion> versionOf(const std::string& path) {
  struct stat status = {};
  return ::stat(path.c_str(), &status) == 0 ? std::optional(versionIn(status)) : std::nullopt;
}

}  // namespace vaelo
