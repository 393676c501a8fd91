// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <functional>
#include <memory>
#include <optional>
#include <vector>

#include "platform/ui/device.h"
#include "platform/ui/document_interaction_controller.h"
#include "platform/ui/document_list_controller.h"
#include "platform/ui/graphics.h"
#include "platform/ui/upgrade_button.h"
#include "platform/ui/upgrade_flow_manager.h"
#include "platform/ui/window.h"

namespace vaelo {

/// Makes the screens that the host provides, and tells of the display. Main thread.
class ScreenFactory {
 public:
  virtual ~ScreenFactory() = default;

  virtual Graphics& graphics() = 0;
  virtual Device& device() = 0;
  virtual WindowRef makeWindow(const Rect& bounds) = 0;

  /// The list of the drive's root, with all containers; null when it can't be made.
  virtual DocumentListControllerRef makeRootList() = 0;
  /// A list of one folder; null when it can't be made.
  virtual DocumentListControllerRef makeList(const URL& folder) = 0;
  /// One list for each folder from the drive's root down to `folder`; nothing when `folder` is not in the drive.
  virtual std::optional<std::vector<DocumentListControllerRef>> hierarchyTo(const URL& folder) = 0;
  /// The screen that says that no account is signed in; null when the host has none.
  virtual ViewControllerRef makeDriveUnavailable() = 0;
  /// Whether the quick preview can show the item; judged without reading its content.
  virtual bool canPreviewItem(const URL& url) = 0;
  virtual std::shared_ptr<DocumentInteractionController> makeDocumentInteraction(const URL& url) = 0;

  /// A button for the offer, which may be null. Never null.
  virtual std::shared_ptr<UpgradeButton> makeUpgradeButton(StorageOfferRef offer) = 0;
  /// `offer` may be null. Never null.
  virtual std::shared_ptr<UpgradeFlowManager> makeUpgradeFlow(StorageOfferRef offer) = 0;

  /// Asks or tells the user what must be settled before the document is opened elsewhere, then runs `open` once, or never.
  /// With nothing to settle `open` has run when this returns.
  virtual void runPreOpenAlert(const URL& url, const ViewControllerRef& presenter, std::function<void()> open) = 0;
};

}  // namespace vaelo
