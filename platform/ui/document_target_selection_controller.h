// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <vector>

#include "platform/ui/view_controller.h"
#include "platform/url.h"

namespace vaelo {

class DocumentTargetSelectionController;

class DocumentTargetSelectionControllerDelegate {
 public:
  virtual ~DocumentTargetSelectionControllerDelegate() = default;
  virtual void documentTargetSelectionControllerDidSelectItemAtURL(DocumentTargetSelectionController& picker,
                                                                   const URL& folder) = 0;
};

/// The platform's folder picker, for a move. Main thread.
class DocumentTargetSelectionController : public ViewController {
 public:
  std::string className() const override { return "DocumentTargetSelectionController"; }
  virtual const std::vector<URL>& itemsToMove() const = 0;
  /// True when folders of other containers may be chosen too.
  virtual bool isCrossContainer() const = 0;
  virtual void setDelegate(std::weak_ptr<DocumentTargetSelectionControllerDelegate> delegate) = 0;
};

}  // namespace vaelo
