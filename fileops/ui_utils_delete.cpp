// SPDX-License-Identifier: GPL-3.0-or-later
// The question that comes before every deletion.
#include "fileops/ui_utils.h"
#include "items/dr_item.h"
#include "items/vlo_log.h"
#include "platform/platform.h"
#include "platform/ui/alert_controller.h"

namespace vaelo {

namespace {

PopoverAnchor anchorAt(const ViewRef& view, const BarButtonItemRef& button) {
  PopoverAnchor anchor;
  if (!view) {
    anchor.barButtonItem = button;
    return anchor;
  }
  const Rect bounds = view->bounds();
  anchor.sourceView = view;
  anchor.sourceRect = {bounds.x, bounds.midY(), bounds.width, 0};
  anchor.permittedArrowDirections = ArrowLeft | ArrowRight;
  return anchor;
}

}  // namespace

std::optional<std::string> UIUtils::messageForDeletePrompt(const std::vector<URL>& urls) {
  Formatting& formatting = Platform::current().formatting;
  if (urls.size() != 1) {
    const std::string items = formatting.localizedCount(".DICT.ITEMS.%d", static_cast<std::int64_t>(urls.size()));
    return formatting.filled(
        formatting.localizedString(
            "%@ will be permanently deleted from Vaelo Drive on all your devices. This action cannot be undone."),
        {items});
  }
  const std::shared_ptr<DRItem> item = DRItem::initWithURL(urls.front());
  const std::string name = item ? item->localizedName().value_or("") : "";
  if (name.empty()) return std::nullopt;
  const std::string format =
      item->isContainer()
          ? formatting.localizedString(
                "The %@ app library, and all its documents, will be permanently deleted from Vaelo Drive on all your "
                "devices. This action cannot be undone.")
          : formatting.localizedString(
                "\"%@\" will be permanently deleted from Vaelo Drive on all your devices. This action cannot be undone.");
  return formatting.filled(format, {name});
}

void UIUtils::showDeleteWarningAlertHasContainerViewControllerUsingViewUsingButtonCompletion(
    const std::vector<URL>& urls, bool /*hasContainer*/, const ViewControllerRef& parent, const ViewRef& view,
    const BarButtonItemRef& button, const DeleteAnswer& completion) {
  if (urls.empty()) {
    completion(nullptr, true);
    return;
  }
  const std::optional<std::string> message = messageForDeletePrompt(urls);
  if (!message) return;
  Formatting& formatting = Platform::current().formatting;
  auto sheet = AlertController::make(AlertStyle::ActionSheet, "", *message);
  const auto deletes = [completion](const AlertActionRef& action) {
    VLO_DEBUG("Delete action");
    completion(action, false);
  };
  const auto cancels = [completion](const AlertActionRef& action) {
    VLO_INFO("Delete: Cancel pressed");
    completion(action, true);
  };
  sheet->addAction(
      AlertAction::make(formatting.localizedString("Delete from Vaelo Drive"), AlertActionStyle::Destructive, deletes));
  sheet->addAction(AlertAction::make(formatting.localizedString("Cancel"), AlertActionStyle::Cancel, cancels));
  sheet->setPopoverAnchor(anchorAt(view, button));
  parent->presentViewController(sheet, true);
}

}  // namespace vaelo
