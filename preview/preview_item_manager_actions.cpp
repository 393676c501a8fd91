// SPDX-License-Identifier: GPL-3.0-or-later
// What a preview's screen has the manager do to the document.
#include "fileops/ui_utils.h"
#include "items/file_utils.h"
#include "items/url_additions.h"
#include "items/vlo_log.h"
#include "preview/preview_item_manager.h"

namespace vaelo {

void PreviewItemManager::showWarningAndDeleteDocumentBarButton(const ViewControllerRef& presenter,
                                                               const BarButtonItemRef& button) {
  const std::optional<URL> url = itemURL();
  std::vector<URL> urls;
  if (url) urls.push_back(*url);
  // Held, since the screens may drop the manager before the user has answered. It follows the document meanwhile, so what
  // goes is the document that was asked about, wherever it is by then, and not another one that took its place.
  const auto answered = [self = shared_from_this(), presenter](const AlertActionRef&, bool cancelled) {
    if (cancelled) {
      VLO_USER_ACTION("Delete was Cancelled (itemMgr)");
      return;
    }
    VLO_USER_ACTION("Delete was Confirmed (itemMgr)");
    const std::optional<URL> document = self->itemURL();
    const std::optional<Error> error = document ? FileUtils::remove(*document) : std::nullopt;
    if (error) UIUtils::showErrorParentViewController(error, presenter);
  };
  UIUtils::showDeleteWarningAlertHasContainerViewControllerUsingViewUsingButtonCompletion(urls, false, presenter, nullptr,
                                                                                          button, answered);
}

void PreviewItemManager::showMoveTarget(const ViewControllerRef& presenter) {
  VLO_INFO("Pressed Move (itemMgr)");
  const std::optional<URL> url = itemURL();
  if (!url) return;
  const std::vector<URL> urls = {*url};
  const auto picker = std::make_shared<DocumentTargetSelectionController>(urls, vlo_canCrossZoneMoveURLs(urls));
  picker->setDelegate(weak_from_this());
  picker->setModalPresentationStyle(PresentationStyle::OverCurrentContext);
  if (const auto navigation = presenter->navigationController()) {
    navigation->presentViewController(picker, true, [] { VLO_DEBUG("Presented moveTarget"); });
  }
}

void PreviewItemManager::documentTargetSelectionControllerDidSelectItemAtURL(
    const std::shared_ptr<DocumentTargetSelectionController>& picker, const URL& folder) {
  VLO_DEBUG("MoveTarget = %@", folder);
  VLO_DEBUG("ItemsToMove = %@", picker->itemsToMove());
  picker->dismissViewControllerAnimated(true);
  for (const URL& item : picker->itemsToMove()) {
    const std::optional<Error> error =
        FileUtils::moveTo(item, folder.appendingPathComponent(item.lastPathComponent(), false));
    const std::shared_ptr<NavigationController> navigation = navigationController();
    if (error && navigation) {
      UIUtils::showFriendlyMoveErrorParentViewController(*error, navigation->topViewController());
    }
  }
}

}  // namespace vaelo
