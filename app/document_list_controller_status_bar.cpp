// SPDX-License-Identifier: GPL-3.0-or-later
#include "app/document_list_controller_status_bar.h"

#include "items/vlo_log.h"
#include "platform/platform.h"
#include "platform/ui/screen_factory.h"

namespace vaelo {

namespace {

constexpr const char* AttachmentKey = "_VaeloDriveAppStatusBar";

}  // namespace

void DocumentListControllerStatusBar::createStatusBarButtonPressDelegate(StorageOfferRef offer,
                                                                         std::weak_ptr<Delegate> delegate) {
  delegate_ = std::move(delegate);
  labelsView_ = DriveStatusLabelView::initWithFrame(Platform::current().screens.device().statusBarFrame());
  configureLabels(offer);
  const BarButtonItemRef space = BarButtonItem::system(SystemItem::FlexibleSpace);
  toolbarItems_ = {space, BarButtonItem::withCustomView(labelsView_), space};
}

void DocumentListControllerStatusBar::configureLabels(const StorageOfferRef& offer) {
  const auto label = std::make_shared<Label>();
  label->setFont(Font::preferred(TextStyle::Caption2));
  label->setOpaque(false);
  label->setTextColor(Color::black());
  label->setBackgroundColor(std::nullopt);
  label->sizeToFit();
  labelsView_->setPrimaryLabel(label);
  const std::shared_ptr<UpgradeButton> button = Platform::current().screens.makeUpgradeButton(offer);
  button->addAction(ControlEvent::TouchUpInside, [weak = weak_from_this()] {
    const auto self = weak.lock();
    if (self) self->upgradeStoragePressed(*self->labelsView_->quotaButton());
  });
  button->sizeToFit();
  button->setHidden(true);
  labelsView_->setQuotaButton(button);
  labelsView_->showLowQuota(offer && button->shouldShowForOffer(*offer));
}

void DocumentListControllerStatusBar::setStatusText(const std::string& text) { labelsView_->setPrimaryLabelText(text); }

void DocumentListControllerStatusBar::showUpgradeOffer(const StorageOfferRef& offer) {
  UpgradeButton& button = *labelsView_->quotaButton();
  if (button.offer() != offer) button.setOffer(offer);
  labelsView_->showLowQuota(offer && button.shouldShowForOffer(*offer));
}

void DocumentListControllerStatusBar::upgradeStoragePressed(UpgradeButton& button) {
  VLO_USER_ACTION("Pressed Upgrade Storage");
  const std::shared_ptr<UpgradeLink> link = button.link();
  const int action = link ? link->action() : 0;
  VLO_INFO("UpgradeStorage button pressed, link.action=%{public}@", action);
  if (link && link->performDefaultAction()) {
    VLO_INFO("UpgradeStorage button pressed, launched default action (Manage Storage?)");
    return;
  }
  const std::shared_ptr<Delegate> listener = delegate();
  if (listener && action == UpgradeLink::ActionRunUpgradeFlow) listener->upgradeStorageButtonPressed();
}

StatusBarRef statusBarOf(const DocumentListController& list) {
  return list.attachmentAs<DocumentListControllerStatusBar>(AttachmentKey);
}

void setStatusBar(DocumentListController& list, const StatusBarRef& bar) { list.setAttachment(AttachmentKey, bar); }

void createStatusBarButtonPressDelegate(DocumentListController& list, StorageOfferRef offer,
                                        std::weak_ptr<DocumentListControllerStatusBarDelegate> delegate) {
  const auto bar = std::make_shared<DocumentListControllerStatusBar>();
  setStatusBar(list, bar);
  bar->createStatusBarButtonPressDelegate(std::move(offer), std::move(delegate));
}

void displayStatusBar(DocumentListController& list) { list.setToolbarItems(statusBarOf(list)->toolbarItems()); }

}  // namespace vaelo
