// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <set>
#include <string>
#include <vector>

#include "platform/ui/screen_factory.h"
#include "tests/support/memory_device.h"
#include "tests/support/memory_document_interaction.h"
#include "tests/support/memory_graphics.h"

namespace vaelo {

/// The host's screens without anything to see.
class MemoryScreens : public ScreenFactory {
 public:
  explicit MemoryScreens(CallRecord& record) : record_(record) {}

  // What can't be made.
  bool hasNoRootList = false;
  bool hasNoHierarchies = false;
  bool hasNoUnavailableScreen = false;
  std::set<std::string> unpreviewable;  ///< by path

  MemoryDevice deviceShown;
  MemoryGraphics drawn;
  std::vector<std::shared_ptr<MemoryDocumentInteraction>> interactions;  ///< all that were made
  /// How each upgrade button comes.
  std::string upgradeTitle = "Upgrade";
  bool hidesUpgrades = false;  ///< no offer is one that a button should be shown for
  ViewControllerRef upgradeFlowPresenter;
  /// True: the user has yet to answer what must be settled before a document opens; `heldOpening` is the answer yes.
  bool holdsOpening = false;
  std::function<void()> heldOpening;
  ViewControllerRef openingPresenter;
  bool opensInPlace = true;  ///< whether applications start

  Graphics& graphics() override { return drawn; }
  Device& device() override { return deviceShown; }
  WindowRef makeWindow(const Rect& bounds) override { return std::make_shared<Window>(bounds); }
  DocumentListControllerRef makeRootList() override;
  DocumentListControllerRef makeList(const URL& folder) override;
  std::optional<std::vector<DocumentListControllerRef>> hierarchyTo(const URL& folder) override;
  ViewControllerRef makeDriveUnavailable() override;
  bool canPreviewItem(const URL& url) override;
  std::shared_ptr<DocumentInteractionController> makeDocumentInteraction(const URL& url) override;
  std::shared_ptr<UpgradeButton> makeUpgradeButton(StorageOfferRef offer) override;
  std::shared_ptr<UpgradeFlowManager> makeUpgradeFlow(StorageOfferRef offer) override;
  void runPreOpenAlert(const URL& url, const ViewControllerRef& presenter, std::function<void()> open) override;

 private:
  CallRecord& record_;
};

}  // namespace vaelo
