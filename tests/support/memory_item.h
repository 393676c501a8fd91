// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <cstdint>
#include <optional>
#include <string>
#include <vector>

#include "platform/file_manager.h"
#include "platform/resource_values.h"

namespace vaelo {

/// What stands at one path of a disk in memory.
struct MemoryItem {
  FileAttributes attributes;
  std::string linkTarget;
  /// Not downloaded: the item is at its logical path, and its promise at the physical one beside it.
  bool isPromise = false;
  /// Nobody may read or change it, nor what is in it.
  bool isLocked = false;

  /// Resource values that a test says; they come before those that follow from the rest.
  ResourceMap values;
  /// True when the resource values are those in `values` and no others.
  bool hasOnlyValues = false;

  std::vector<std::string> tags;
  std::optional<std::string> shareRole;
  std::optional<URL> bookmarkTarget;
  std::optional<URL> aliasTarget;
  std::int64_t documentID = 0;  ///< 0: none yet

  FileType type() const { return attributes.type.value_or(FileType::Regular); }
  bool isFolder() const { return type() == FileType::Directory; }
};

}  // namespace vaelo
