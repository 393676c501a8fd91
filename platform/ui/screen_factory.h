// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <functional>
#include <memory>
#include <optional>
#include <vector>

#include "platform/ui/document_interaction_controller.h"
#include "platform/ui/document_list_controller.h"
#include "platform/ui/window.h"

namespace vaelo {

/// Makes the platform's own screens. Main thread.
class ScreenFactory {
 public:
  virtual ~ScreenFactory() = default;
  /// A window with the main screen's bounds; not shown yet.
  virtual std::shared_ptr<Window> makeWindow() = 0;
  virtual InterfaceIdiom idiom() = 0;
  /// A list of the root of the drive (all containers); null when none can be made.
  virtual DocumentListControllerRef makeRootList() = 0;
  virtual DocumentListControllerRef makeList(const URL& folder) = 0;
  /// The lists from the drive's root down to `folder`, one a level; nothing when the folder is not in the drive.
  virtual std::optional<std::vector<DocumentListControllerRef>> makeListHierarchyDownTo(const URL& folder) = 0;
  /// The list that is shown as the peek of a folder; it has no search.
  virtual DocumentListControllerRef makePeekFolderViewController(const URL& folder) = 0;
  /// The screen for a drive without an account; null when the platform has none.
  virtual ViewControllerRef makeDriveUnavailableController() = 0;
  virtual std::shared_ptr<DocumentInteractionController> makeDocumentInteractionController(const URL& url) = 0;
  /// Whether the quick preview can show the item.
  virtual bool canPreviewItem(const URL& url) = 0;
  /// Says what the user must know before another application opens the document, then runs `action` once when it may.
  virtual void presentPreOpenAlertIfNeeded(const URL& url, const ViewControllerRef& over, std::function<void()> action) = 0;
};

}  // namespace vaelo
