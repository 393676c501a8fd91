// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <memory>
#include <vector>

#include "platform/ui/view_controller.h"
#include "platform/url.h"

namespace vaelo {

class DocumentTargetSelectionController;

class DocumentTargetSelectionControllerDelegate {
 public:
  virtual ~DocumentTargetSelectionControllerDelegate() = default;
  virtual void documentTargetSelectionControllerDidSelectItemAtURL(
      const std::shared_ptr<DocumentTargetSelectionController>& picker, const URL& folder) = 0;
};

/// Lets the user pick the folder that items move to. The host shows it; the delegate dismisses it. Main thread.
class DocumentTargetSelectionController : public ViewController {
 public:
  /// `crossContainer`: folders of other libraries may be picked as well.
  DocumentTargetSelectionController(std::vector<URL> itemsToMove, bool crossContainer);
  std::string className() const override { return "DocumentTargetSelectionController"; }
  const std::vector<URL>& itemsToMove() const { return itemsToMove_; }
  bool allowsCrossContainer() const { return crossContainer_; }
  std::shared_ptr<DocumentTargetSelectionControllerDelegate> delegate() const { return delegate_.lock(); }
  void setDelegate(std::weak_ptr<DocumentTargetSelectionControllerDelegate> delegate) { delegate_ = std::move(delegate); }
  /// For the host: the user picked the folder.
  void userSelected(const URL& folder);
  /// For the host: the user gave up; the picker goes away.
  void userCancelled();

 private:
  std::vector<URL> itemsToMove_;
  bool crossContainer_;
  std::weak_ptr<DocumentTargetSelectionControllerDelegate> delegate_;
};

}  // namespace vaelo
