// SPDX-License-Identifier: GPL-3.0-or-later
#include "app/status_bar.h"

namespace vaelo {

namespace {
constexpr const char* AttachmentKey = "_VaeloDriveAppStatusBar";
}

DocumentListControllerStatusBar::DocumentListControllerStatusBar() : primaryLabel_(std::make_shared<Label>()) {
  primaryLabel_->setFont(Font::preferred(TextStyle::Caption2));
  const BarButtonItemRef space = BarButtonItem::system(SystemItem::FlexibleSpace);
  toolbarItems_ = {space, BarButtonItem::withCustomView(primaryLabel_), space};
}

std::shared_ptr<DocumentListControllerStatusBar> DocumentListControllerStatusBar::of(const DocumentListController& list) {
  return list.attachmentAs<DocumentListControllerStatusBar>(AttachmentKey);
}

void DocumentListControllerStatusBar::attachTo(DocumentListController& list,
                                               std::shared_ptr<DocumentListControllerStatusBar> statusBar) {
  list.setAttachment(AttachmentKey, std::move(statusBar));
}

}  // namespace vaelo
