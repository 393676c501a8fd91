// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <memory>
#include <string>
#include <vector>

#include "host/gtk/list/folder_snapshot.h"

namespace vaelo {

/// A folder's entries, or why they could not be read.
struct FolderReading {
  std::shared_ptr<const FolderSnapshot> snapshot;  ///< null on failure
  int errorNumber = 0;                             ///< errno of the failure
};

/// Reads and sorts the names of a folder. Blocks, so belongs on a worker; any thread. Reads the folder's own record alone:
/// links are followed by one stat each, promises with a hashed name are opened, nothing else is touched. Hidden names are
/// left out, promises stand under the name of their item.
FolderReading readFolder(const std::string& path);

/// What `names` (of items, not of promise files) stand for in the folder now. Blocks; any thread. Without a folder all are
/// gone.
std::vector<EntryChange> lookUpNames(const std::string& path, const std::vector<std::string>& names);

/// The number of entries that readFolder() would list for the folder `name` in the open folder, or -1 where it can't be
/// read. Blocks; any thread.
long countEntries(int folder, const char* name);

}  // namespace vaelo
