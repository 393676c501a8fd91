// SPDX-License-Identifier: GPL-3.0-or-later
#include "preview/preview_details_view_controller.h"

#include "fileops/ui_utils.h"
#include "items/dr_item.h"
#include "items/launch_utils.h"
#include "items/vlo_log.h"
#include "platform/platform.h"
#include "preview/preview_item_manager.h"

namespace vaelo {

std::shared_ptr<DRItem> PreviewDetailsViewController::shownItem() const {
  const std::shared_ptr<PreviewItemManager> manager = itemManager();
  return manager ? manager->item() : nullptr;
}

void PreviewDetailsViewController::viewDidLoad() {
  PreviewBaseViewController::viewDidLoad();
  makeOpenInAppButton();
  setupViewsAndConstraints();
  view()->setUserInteractionEnabled(true);
  view()->addGestureRecognizer(std::make_shared<TapGestureRecognizer>([weak = weakSelf(this)] {
    if (const auto self = weak.lock()) self->viewWasTapped();
  }));
  registerForKeyboardNotifications();
}

void PreviewDetailsViewController::makeOpenInAppButton() {
  const std::shared_ptr<DRItem> item = shownItem();
  if (!item || !item->url()) return;
  const std::optional<std::string> application = LaunchUtils::defaultAppNameForDocumentRequireOpenIn(*item->url(), true);
  if (!application) return;
  Formatting& formatting = Platform::current().formatting;
  openInAppButton_ = std::make_shared<Button>(ButtonType::System);
  openInAppButton_->setTitle(formatting.filled(formatting.localizedString("Open in “%@”"), {*application}));
}

void PreviewDetailsViewController::viewWillDisappear(bool animated) {
  originalFilename_ = filenameTextField_->text();
  unregisterForKeyboardNotifications();
  PreviewBaseViewController::viewWillDisappear(animated);
}

void PreviewDetailsViewController::viewWillTransitionToSize(const Size& size, TransitionCoordinator& coordinator) {
  PreviewBaseViewController::viewWillTransitionToSize(size, coordinator);
  if (!isViewLoaded()) return;
  fileDetailsView_->invalidateIntrinsicContentSize();
  adjustViewsForOrientation(size.width > size.height ? InterfaceOrientation::LandscapeRight
                                                     : InterfaceOrientation::Portrait);
  configureMargins();
  refreshItem();
}

void PreviewDetailsViewController::refreshItem() {
  PreviewBaseViewController::refreshItem();
  // The document may change or move before the screen is first shown, which reads it anyway.
  if (!isViewLoaded()) return;
  const std::shared_ptr<DRItem> item = shownItem();
  fileInfoView_->setItem(item);
  originalFilename_ = item ? item->localizedName() : std::nullopt;
  originalSuffix_ = std::nullopt;
  if (originalFilename_ && !item->hasHiddenExtension()) originalSuffix_ = URL("/" + *originalFilename_).pathExtension();
  filenameTextField_->setText(originalFilename_.value_or(""));
  filenameTextField_->setPlaceholder("");
  thumbnailView_->setItem(item);
}

bool PreviewDetailsViewController::shouldDisplayOpenInAppButtonInView() const {
  return openInAppButton_ && UIUtils::slateMode();
}

std::shared_ptr<Button> PreviewDetailsViewController::openInAppNavControllerButton() {
  return shouldDisplayOpenInAppButtonInView() ? nullptr : openInAppButton_;
}

}  // namespace vaelo
