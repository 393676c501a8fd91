// SPDX-License-Identifier: GPL-3.0-or-later
#include "tests/support/memory_screens.h"

#include <deque>

#include "tests/support/memory_drive_places.h"
#include "tests/support/memory_upgrade_button.h"
#include "tests/support/memory_upgrade_flow.h"

namespace vaelo {

namespace {

struct Unavailable : ViewController {
  std::string className() const override { return "DriveUnavailableController"; }
};

}  // namespace

DocumentListControllerRef MemoryScreens::makeRootList() {
  if (hasNoRootList) return nullptr;
  const auto list = std::make_shared<DocumentListController>(Drive, true);
  list->setTitle("Vaelo Drive");
  return list;
}

DocumentListControllerRef MemoryScreens::makeList(const URL& folder) {
  const auto list = std::make_shared<DocumentListController>(folder);
  list->setTitle(folder.lastPathComponent());
  return list;
}

std::optional<std::vector<DocumentListControllerRef>> MemoryScreens::hierarchyTo(const URL& folder) {
  if (hasNoHierarchies || !folder.isInside(Drive)) return std::nullopt;
  std::deque<DocumentListControllerRef> lists;
  for (URL above = folder; !(above == Drive); above = above.deletingLastPathComponent()) {
    lists.push_front(makeList(above));
  }
  lists.push_front(makeRootList());
  return std::vector<DocumentListControllerRef>(lists.begin(), lists.end());
}

ViewControllerRef MemoryScreens::makeDriveUnavailable() {
  return hasNoUnavailableScreen ? nullptr : std::make_shared<Unavailable>();
}

bool MemoryScreens::canPreviewItem(const URL& url) {
  record_.calls.push_back("canPreview " + url.path());
  return !unpreviewable.contains(url.path());
}

std::shared_ptr<DocumentInteractionController> MemoryScreens::makeDocumentInteraction(const URL& url) {
  interactions.push_back(std::make_shared<MemoryDocumentInteraction>(url, record_));
  interactions.back()->opens = opensInPlace;
  return interactions.back();
}

std::shared_ptr<UpgradeButton> MemoryScreens::makeUpgradeButton(StorageOfferRef offer) {
  const auto button = std::make_shared<MemoryUpgradeButton>(std::move(offer), hidesUpgrades);
  button->setTitle(upgradeTitle);
  return button;
}

std::shared_ptr<UpgradeFlowManager> MemoryScreens::makeUpgradeFlow(StorageOfferRef offer) {
  return std::make_shared<MemoryUpgradeFlow>(std::move(offer), upgradeFlowPresenter);
}

void MemoryScreens::runPreOpenAlert(const URL& url, const ViewControllerRef& presenter, std::function<void()> open) {
  record_.calls.push_back("preOpenAlert " + url.path());
  openingPresenter = presenter;
  if (holdsOpening) {
    heldOpening = std::move(open);
  } else {
    open();
  }
}

}  // namespace vaelo
