// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <functional>
#include <map>
#include <memory>
#include <optional>
#include <string>
#include <vector>

#include "platform/ui/document_list_controller_delegate.h"
#include "platform/ui/url_list.h"

namespace vaelo {

class SearchController;

enum class DocumentListChange { Items, Selection, Editing, AvailableActions, Search };

/// A list of one folder of the drive. Main thread.
///
/// The model holds what the screens ask for; the host fills it from the folder and shows it. The operations under "For the
/// host" are what the user and the folder do; tests use them as well. The delegate is held weakly.
class DocumentListController : public ViewController {
 public:
  /// A list of the folder; `allContainers` makes it the drive's root list, which also shows the libraries. Use
  /// ScreenFactory, so that the host knows of the list, except in subclasses.
  explicit DocumentListController(std::optional<URL> presentedURL, bool allContainers = false);
  ~DocumentListController() override;
  std::string className() const override { return "DocumentListController"; }

  const std::optional<URL>& presentedURL() const { return presentedURL_; }
  bool showsAllContainers() const { return allContainers_; }
  /// In the order in which they are shown.
  const URLList& containedItems() const { return containedItems_; }
  /// In the list's order. Made when asked for the first time, which for 100,000 items takes some 20 ms.
  const std::vector<URL>& selectedItems() const;
  std::size_t selectedItemCount() const { return selection_.size(); }
  /// The selected items but those that the list knows to be documents.
  std::vector<URL> selectedItemsThatMayBeFolders() const;
  /// The selected items but those that the list knows to be documents or folders like any other.
  std::vector<URL> selectedItemsThatMayBeSpecial() const;
  /// Selects those that the list contains, in the list's order, and reports itemsChanged if that changes the selection.
  void setSelectedItems(const std::vector<URL>& items);
  /// The same for all that it contains.
  void selectAllItems();
  bool editing() const { return editing_; }
  /// Leaving clears the selection without a report: whoever switches the mode refreshes its own screen.
  void setEditingAnimated(bool editing, bool animated);
  unsigned availableActions() const { return availableActions_; }
  void setAvailableActions(unsigned actions);
  std::shared_ptr<DocumentListControllerDelegate> delegate() const { return delegate_.lock(); }
  void setDelegate(std::weak_ptr<DocumentListControllerDelegate> delegate) { delegate_ = std::move(delegate); }
  /// Presents a SearchController with the query, or gives the query to the one that is there.
  void startSearchWithQueryStringBecomeFirstResponder(const std::string& query, bool becomeFirstResponder);
  /// Whether the list offers a search field.
  virtual bool shouldShowSearch() const { return true; }
  /// Scrolls up and down for a performance harness; a list that nobody shows does nothing.
  void runScrollTest(const std::string& name, int iterations, int delta, int listMode);

  /// Keeps an object for as long as the list lives; null drops it.
  void setAttachment(const std::string& key, std::shared_ptr<void> object);
  std::shared_ptr<void> attachment(const std::string& key) const;
  /// The caller knows which class it attached.
  template <typename T>
  std::shared_ptr<T> attachmentAs(const std::string& key) const {
    return std::static_pointer_cast<T>(attachment(key));
  }

  // For the host.
  /// The folder's items are these now; selected ones that are gone are no longer selected. Always reports itemsChanged.
  void itemsLoaded(URLList items);
  /// The user selected what stands at these places, ascending, and nothing else. Reports like setSelectedItems.
  void userSelected(std::vector<std::size_t> places);
  /// Where the selected items stand, ascending.
  const std::vector<std::size_t>& selection() const { return selection_; }
  /// The folder moved or was renamed.
  void folderMoved(const URL& url);
  void folderWasRemoved();
  void userSelectedContainer(const DocumentListControllerRef& chosen);
  void userSelectedItem(const URL& url);
  void userChoseAction(int action, const URL& url, const ViewRef& view, std::function<void()> completion);
  ViewControllerRef viewControllerForPreviewing(const URL& url);
  /// Emitted after a property changed.
  Signal<DocumentListController&, DocumentListChange>& listChanged() { return listChanged_; }
  using ScrollTest = std::function<void(const std::string& name, int iterations, int delta, int listMode)>;
  void setScrollTest(ScrollTest test) { scrollTest_ = std::move(test); }

 private:
  DocumentListControllerRef self();
  void select(std::vector<std::size_t> places);
  std::vector<URL> selectedItemsUnless(const std::function<bool(ItemHint)>& isKnown) const;

  std::optional<URL> presentedURL_;
  bool allContainers_;
  bool editing_ = false;
  unsigned availableActions_ = 0;
  URLList containedItems_;
  std::vector<std::size_t> selection_;
  mutable std::optional<std::vector<URL>> selectedItems_;
  std::weak_ptr<DocumentListControllerDelegate> delegate_;
  std::map<std::string, std::shared_ptr<void>> attachments_;
  ScrollTest scrollTest_;
  Signal<DocumentListController&, DocumentListChange> listChanged_;
};

}  // namespace vaelo
