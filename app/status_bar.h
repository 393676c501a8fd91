// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <memory>
#include <string>
#include <vector>

#include "platform/ui/bar_button_item.h"
#include "platform/ui/document_list_controller.h"
#include "platform/ui/label.h"

namespace vaelo {

/// The line under a list that says how much is in it and how much room is left. Main thread.
class DocumentListControllerStatusBar {
 public:
  DocumentListControllerStatusBar();
  void setStatusText(const std::string& text) { primaryLabel_->setText(text); }
  const std::string& statusText() const { return primaryLabel_->text(); }
  /// A flexible space, the line, a flexible space.
  const std::vector<BarButtonItemRef>& toolbarItems() const { return toolbarItems_; }

  /// The status bar that a list carries; null for none.
  static std::shared_ptr<DocumentListControllerStatusBar> of(const DocumentListController& list);
  static void attachTo(DocumentListController& list, std::shared_ptr<DocumentListControllerStatusBar> statusBar);

 private:
  std::shared_ptr<Label> primaryLabel_;
  std::vector<BarButtonItemRef> toolbarItems_;
};

}  // namespace vaelo
