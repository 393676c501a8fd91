// SPDX-License-Identifier: GPL-3.0-or-later
#include "app/nav_controller.h"
#include "items/dr_item.h"
#include "items/url_additions.h"
#include "items/vlo_log.h"
#include "platform/platform.h"
#include "platform/ui/screen_factory.h"

namespace vaelo {

void NavController::documentListControllerPerformActionURLOriginatingViewCompletion(const DocumentListControllerRef& list,
                                                                                    int action, const URL& url,
                                                                                    const ViewRef& view,
                                                                                    Completion completion) {
  const auto complete = [&completion] {
    if (completion) completion();
  };
  switch (action) {
    case ItemAction::Delete:
      VLO_USER_ACTION("DLC Action Delete");
      performActionCompletionBlock_ = completion;
      showWarningAndDeleteURLsUsingViewWithDocumentListControllerFinishedCompletion({url}, view, nullptr, completion);
      break;
    case ItemAction::More:
      // No list offers it any more, so no row waits for it to complete.
      VLO_USER_ACTION("DLC Action More");
      VLO_ERROR("performAction:%{public}@ -- More is deprecated, unexpected value", action);
      break;
    case ItemAction::Info:
      VLO_USER_ACTION("DLC Action Info");
      showInfo(url);
      complete();
      break;
    case ItemAction::Rename:
      VLO_USER_ACTION("DLC Action Rename");
      VLO_INFO("Rename action: %@", url);
      showRenamePrompt(url);
      complete();
      break;
    case ItemAction::Share:
      VLO_USER_ACTION("DLC Action Share (share sheet)");
      VLO_INFO("Activity (share) action: %@", url);
      complete();
      showDICUrlCompletion(view, Value(url), completion);
      break;
    case ItemAction::Move:
      VLO_USER_ACTION("DLC Action Move");
      VLO_INFO("Move action: %@", url);
      showMoveTargetForItemsInFolder({url}, list ? list->presentedURL() : std::nullopt);
      complete();
      break;
    case ItemAction::FirmpressPop:
      VLO_USER_ACTION("DLC Action Firmpress Pop");
      VLO_INFO("Preview action: %@", url);
      complete();
      orbPopToURL(url);
      break;
    default:
      VLO_ERROR("performAction:%{public}@ -- unexpected value", action);
      complete();
  }
}

void NavController::documentListControllerPerformActionURL(const DocumentListControllerRef& list, int action,
                                                           const URL& url) {
  documentListControllerPerformActionURLOriginatingViewCompletion(list, action, url, view(), [] {});
}

void NavController::showInfo(const URL& url) {
  VLO_INFO("Info action: %@", url);
  const std::shared_ptr<DRItem> item = DRItem::initWithURL(url);
  VLO_INFO("Info action item: %@", item);
  showPreviewPreviewMode(item, 1);
}

void NavController::showDICUrlCompletion(const ViewRef& anchor, const Value& item, Completion completion) {
  VLO_USER_ACTION("Show Share Sheet (nav)");
  VLO_INFO("showDIC: %@", item);
  const URL* url = item.get<URL>();
  if (!url) {
    VLO_WARNING("showDIC: url is wrong class: %@", item.className());
    return;
  }
  const URL shared = vlo_URLByResolvingBookmark(*url).value_or(*url);
  if (shared != *url) VLO_INFO("URL resolved to %@", shared);
  performActionCompletionBlock_ = std::move(completion);
  // Without an anchor the sheet belongs to the whole window, and points at nothing in it.
  const Rect bounds = anchor ? anchor->bounds() : Rect();
  const Rect rect = {bounds.x, bounds.midY(), bounds.width, 0};
  CloudDocuments& drive = Platform::current().cloudDocuments;
  const auto sheet = Platform::current().screens.makeDocumentInteraction(shared);
  if (!sheet) return;
  if (drive.isDocumentsContainer(shared)) {
    const Result<CloudContainerRef> container = drive.containerForURL(shared);
    if (container.value && *container.value) sheet->setName((*container.value)->localizedName());
  }
  sheet->setDelegate(weakSelf(this));
  documentInteractionController_ = sheet;
  sheet->presentOptionsMenuFromRect(rect, anchor ? anchor : view(), true);
}

}  // namespace vaelo
