// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <string>
#include <vector>

#include "host/gtk/list/folder_model.h"
#include "platform/cloud_documents.h"
#include "platform/url.h"

namespace vaelo {

/// One step of the way to the folder that items are to move to.
struct MoveTarget {
  std::vector<FolderEntry> folders;  ///< where one can go on from here
  /// Why the items can't be put here; empty when they can.
  std::string refusal;
  bool takesFolders = false;  ///< whether a new folder can be made here
};

/// Looks at a folder as a place for items: the folders in it, without those that are moved, and whether the container takes
/// items of these types at this depth. `libraries`: also list the other containers. Blocks on the disk; any thread.
MoveTarget moveTargetAt(const URL& folder, const std::vector<URL>& items, bool libraries, CloudDocuments& drive);

}  // namespace vaelo
