// SPDX-License-Identifier: GPL-3.0-or-later
#include "app/document_list_controller_status_bar.h"

namespace vaelo {

namespace {

constexpr const char* AttachmentKey = "_VaeloDriveAppStatusBar";

}  // namespace

void DocumentListControllerStatusBar::createStatusBarButtonPressDelegate(StorageOfferRef offer,
                                                                         std::weak_ptr<Delegate> delegate) {
  delegate_ = std::move(delegate);
  primaryLabel_ = std::make_shared<Label>();
  primaryLabel_->setFont(Font::preferred(TextStyle::Caption2));
  primaryLabel_->setOpaque(false);
  primaryLabel_->setTextColor(Color::black());
  primaryLabel_->setBackgroundColor(std::nullopt);
  primaryLabel_->sizeToFit();
  const BarButtonItemRef space = BarButtonItem::system(SystemItem::FlexibleSpace);
  toolbarItems_ = {space, BarButtonItem::withCustomView(primaryLabel_), space};
  showUpgradeOffer(std::move(offer));
}

void DocumentListControllerStatusBar::setStatusText(const std::string& text) {
  primaryLabel_->setText(text);
  primaryLabel_->sizeToFit();
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
