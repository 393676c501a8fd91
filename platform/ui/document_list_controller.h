// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <map>
#include <optional>
#include <vector>

#include "platform/ui/view_controller.h"
#include "platform/url.h"

namespace vaelo {

/// Per-item actions of a list; bit n of the available actions is code n.
enum ItemAction {
  ItemActionDelete = 0,
  ItemActionMore = 1,
  ItemActionInfo = 2,
  ItemActionRename = 3,
  ItemActionShare = 4,
  ItemActionMove = 5,
  ItemActionFirmpressPop = 6,
};

class DocumentListController;
using DocumentListControllerRef = std::shared_ptr<DocumentListController>;

/// Told what the user does in a list. Main thread.
class DocumentListControllerDelegate {
 public:
  virtual ~DocumentListControllerDelegate() = default;
  /// A folder was chosen; `folder` is a ready list of it.
  virtual void documentListControllerDidSelectContainerWithViewController(const DocumentListControllerRef& list,
                                                                          const DocumentListControllerRef& folder) = 0;
  virtual void documentListControllerDidSelectItemAtURL(const DocumentListControllerRef& list, const URL& url) = 0;
  /// Its items or its selection changed.
  virtual void documentListControllerItemsChanged(const DocumentListControllerRef& list) = 0;
  virtual void documentListControllerURLWasRemoved(const DocumentListControllerRef& list) = 0;
  virtual void documentListControllerPerformActionURLOriginatingViewCompletion(
      const DocumentListControllerRef& list, int action, const URL& url, const std::shared_ptr<View>& originatingView,
      std::function<void()> completion) = 0;
  virtual void documentListControllerPerformActionURL(const DocumentListControllerRef& list, int action, const URL& url) = 0;
  virtual ViewControllerRef documentListControllerViewControllerForPreviewingItemAtURL(const DocumentListControllerRef& list,
                                                                                       const URL& url) = 0;
};

/// The platform's list of one folder, or of the root of the drive. Main thread.
class DocumentListController : public ViewController {
 public:
  std::string className() const override { return "DocumentListController"; }
  /// The folder it shows; the default container's for the root list. Nothing when there is none.
  virtual std::optional<URL> presentedURL() const = 0;
  /// The items that it shows now, in order.
  virtual std::vector<URL> containedItems() const = 0;
  virtual std::size_t containedItemCount() const = 0;
  virtual std::vector<URL> selectedItems() const = 0;
  virtual void setSelectedItems(const std::vector<URL>& items) = 0;
  virtual bool isEditing() const = 0;
  virtual void setEditingAnimated(bool editing, bool animated) = 0;
  virtual unsigned availableActions() const = 0;
  virtual void setAvailableActions(unsigned actions) = 0;
  virtual void setDelegate(std::weak_ptr<DocumentListControllerDelegate> delegate) = 0;
  /// Opens the search field with the query; the empty string opens an empty one.
  virtual void startSearchWithQueryStringBecomeFirstResponder(const std::string& query, bool becomeFirstResponder) = 0;
  virtual bool shouldShowSearch() const { return true; }

  /// An object that lives as long as the list, under a key; null takes it away.
  void setAttachment(const std::string& key, std::shared_ptr<void> object);
  std::shared_ptr<void> attachment(const std::string& key) const;

 private:
  std::map<std::string, std::shared_ptr<void>> attachments_;
};

/// The search of a list while it is open; it is presented over the list.
class SearchController : public ViewController {
 public:
  std::string className() const override { return "SearchController"; }
};

}  // namespace vaelo
