// SPDX-License-Identifier: GPL-3.0-or-later
#include "preview/glimpse_item_controller.h"

#include "items/dr_item.h"
#include "items/vlo_log.h"
#include "platform/platform.h"
#include "platform/ui/shared_self.h"
#include "preview/preview_item_manager.h"

namespace vaelo {

// The screen is its own data source and delegate, which it can only say once somebody owns it.
std::shared_ptr<GlimpseItemController> GlimpseItemController::make() {
  auto controller = std::make_shared<GlimpseItemController>();
  controller->setDelegate(controller);
  controller->setDataSource(controller);
  const auto weak = weakSelf(controller.get());
  const auto deletes = [weak](const BarButtonItemRef& sender) {
    if (const auto self = weak.lock()) self->showWarningAndDeleteDocument(sender);
  };
  const auto moves = [weak](const BarButtonItemRef& sender) {
    if (const auto self = weak.lock()) self->showMoveTarget(sender);
  };
  controller->setAdditionalRightBarButtonItems(
      {BarButtonItem::system(SystemItem::Trash, deletes), BarButtonItem::system(SystemItem::Organize, moves)});
  return controller;
}

const std::shared_ptr<GlimpseItemController>& GlimpseItemController::defaultController() {
  static const std::shared_ptr<GlimpseItemController> shared = make();
  return shared;
}

std::shared_ptr<GlimpseItemController> GlimpseItemController::initWithItemManager(
    const std::shared_ptr<PreviewItemManager>& manager) {
  std::shared_ptr<GlimpseItemController> controller = make();
  controller->takeDocumentsOf(manager);
  return controller;
}

void GlimpseItemController::glimpseNewItem(const std::shared_ptr<PreviewItemManager>& manager) {
  takeDocumentsOf(manager);
  VLO_DEBUG("GLPreviewController: reloadData");
  reloadData();
}

void GlimpseItemController::takeDocumentsOf(const std::shared_ptr<PreviewItemManager>& manager) {
  itemManager_ = manager;
  arrayOfDocuments_.reset();
  const std::shared_ptr<DRItem> item = manager ? manager->item() : nullptr;
  if (item && item->resolvedURL()) arrayOfDocuments_ = {*item->resolvedURL()};
}

bool GlimpseItemController::isVisible() const {
  return isViewLoaded() && const_cast<GlimpseItemController*>(this)->view()->isInWindow();
}

void GlimpseItemController::viewWillDisappear(bool animated) {
  if (const auto manager = itemManager_.lock()) manager->viewControllerWillDisappear(shared_from_this());
  PreviewController::viewWillDisappear(animated);
}

void GlimpseItemController::showMoveTarget(const BarButtonItemRef&) {
  VLO_USER_ACTION("Pressed Move (GL)");
  VLO_INFO("Pressed Move");
  if (const auto manager = itemManager_.lock()) manager->showMoveTarget(shared_from_this());
}

void GlimpseItemController::showWarningAndDeleteDocument(const BarButtonItemRef& sender) {
  VLO_USER_ACTION("Pressed Delete (GL)");
  if (const auto manager = itemManager_.lock()) manager->showWarningAndDeleteDocumentBarButton(shared_from_this(), sender);
}

std::size_t GlimpseItemController::numberOfPreviewItemsInPreviewController(PreviewController&) {
  return arrayOfDocuments_ ? arrayOfDocuments_->size() : 0;
}

URL GlimpseItemController::previewControllerPreviewItemAtIndex(PreviewController&, std::size_t index) {
  return arrayOfDocuments_->at(index);
}

bool GlimpseItemController::_glPreviewItemIsPDFKind(const URL& item) {
  TypeIdentifiers& types = Platform::current().types;
  const std::optional<std::string> type = types.preferredIdentifierForExtension(item.pathExtension());
  return type && types.conformsTo(*type, "com.adobe.pdf");
}

bool GlimpseItemController::previewControllerCanEditItem(PreviewController&, const URL& item) {
  return _glPreviewItemIsPDFKind(item);
}

bool GlimpseItemController::previewControllerShouldSaveEditedItem(PreviewController&, const URL& item) {
  return _glPreviewItemIsPDFKind(item);
}

}  // namespace vaelo
