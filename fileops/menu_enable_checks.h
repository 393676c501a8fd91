// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <vector>

#include "platform/ui/document_list_controller.h"
#include "platform/url.h"

namespace vaelo {

/// What may be offered for the folder on screen and the items selected in it. Reads only, and shows nothing. Main thread;
/// looks at the disk.
class MenuEnableChecks {
 public:
  static bool canShowMoveForSelectedItems(const DocumentListController& list);
  static bool canShowDeleteForSelectedItems(const DocumentListController& list);
  static bool canEnableNewFolderForSelectedItems(const DocumentListController& list);
  /// Whether the container of the folder on screen takes folders at any depth.
  static bool containerSupportsAnyDepth(const DocumentListController& list);
  /// Whether the container of the item has a real folder at its top: false for packages and hidden ones. An unknown
  /// container is taken to have some.
  static bool containerHasSubfolders(const URL& url);
  /// How many of the URLs are a container's top folder.
  static unsigned numContainersInURLArray(const std::vector<URL>& urls);
  /// 1 if any of the URLs is a folder, else 0.
  static unsigned numFoldersInURLArray(const std::vector<URL>& urls);
  static bool isDesktopOrDocumentsInURLArray(const std::vector<URL>& urls);
};

}  // namespace vaelo
