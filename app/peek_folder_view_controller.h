// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <vector>

#include "platform/ui/alert_action.h"
#include "platform/ui/document_list_controller.h"

namespace vaelo {

/// The list of a folder while the folder is firmly pressed. Main thread.
class PeekFolderViewController : public DocumentListController {
 public:
  explicit PeekFolderViewController(const URL& folder) : DocumentListController(folder) {}
  std::string className() const override { return "PeekFolderViewController"; }
  bool shouldShowSearch() const override { return false; }
  /// What the peek offers when it is dragged up.
  const std::vector<AlertActionRef>& previewActionItems() const { return previewActionItems_; }
  void setPreviewActionItems(std::vector<AlertActionRef> items) { previewActionItems_ = std::move(items); }

 private:
  std::vector<AlertActionRef> previewActionItems_;
};

}  // namespace vaelo
