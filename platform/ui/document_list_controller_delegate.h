// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <functional>
#include <memory>

#include "platform/ui/view_controller.h"
#include "platform/url.h"

namespace vaelo {

class DocumentListController;
using DocumentListControllerRef = std::shared_ptr<DocumentListController>;

/// Codes of the actions that a list offers for each item; bit n of the available actions stands for code n.
namespace ItemAction {
inline constexpr int Delete = 0;
inline constexpr int More = 1;
inline constexpr int Info = 2;
inline constexpr int Rename = 3;
inline constexpr int Share = 4;
inline constexpr int Move = 5;
inline constexpr int FirmpressPop = 6;
}  // namespace ItemAction

/// Hears what happens in a list of documents. Main thread.
class DocumentListControllerDelegate {
 public:
  using Completion = std::function<void()>;
  virtual ~DocumentListControllerDelegate() = default;
  /// A folder was chosen; `chosen` is a ready list of it, not yet shown.
  virtual void documentListControllerDidSelectContainerWithViewController(const DocumentListControllerRef& list,
                                                                          const DocumentListControllerRef& chosen) = 0;
  virtual void documentListControllerDidSelectItemAtURL(const DocumentListControllerRef& list, const URL& url) = 0;
  /// Items or selection changed.
  virtual void documentListControllerItemsChanged(const DocumentListControllerRef& list) = 0;
  /// The folder that the list shows is gone.
  virtual void documentListControllerURLWasRemoved(const DocumentListControllerRef& list) = 0;
  /// `view` (may be null) is where the action came from; `completion` (may be empty) frees the item's row.
  virtual void documentListControllerPerformActionURLOriginatingViewCompletion(const DocumentListControllerRef& list,
                                                                               int action, const URL& url,
                                                                               const ViewRef& view,
                                                                               Completion completion) = 0;
  virtual void documentListControllerPerformActionURL(const DocumentListControllerRef& list, int action, const URL& url) = 0;
  /// The screen to show while the item is firmly pressed; null for none.
  virtual ViewControllerRef documentListControllerViewControllerForPreviewingItemAtURL(const DocumentListControllerRef& list,
                                                                                       const URL& url) = 0;
};

}  // namespace vaelo
