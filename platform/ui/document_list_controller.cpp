// SPDX-License-Identifier: GPL-3.0-or-later
#include "platform/ui/document_list_controller.h"

#include <utility>

#include "platform/ui/search_controller.h"

namespace vaelo {

DocumentListController::DocumentListController(std::optional<URL> presentedURL, bool allContainers)
    : presentedURL_(std::move(presentedURL)), allContainers_(allContainers) {}

DocumentListController::~DocumentListController() = default;

DocumentListControllerRef DocumentListController::self() { return sharedSelf(this); }

void DocumentListController::setSelectedItems(const std::vector<URL>& items) {
  std::vector<URL> selected = containedItems_.thoseOf(items);
  if (selected == selectedItems_) return;
  selectedItems_ = std::move(selected);
  listChanged_.emit(*this, DocumentListChange::Selection);
  if (const auto told = delegate()) told->documentListControllerItemsChanged(self());
}

void DocumentListController::setEditingAnimated(bool editing, bool) {
  if (editing_ == editing) return;
  editing_ = editing;
  if (!editing && !selectedItems_.empty()) {
    selectedItems_.clear();
    listChanged_.emit(*this, DocumentListChange::Selection);
  }
  listChanged_.emit(*this, DocumentListChange::Editing);
}

void DocumentListController::setAvailableActions(unsigned actions) {
  if (availableActions_ == actions) return;
  availableActions_ = actions;
  listChanged_.emit(*this, DocumentListChange::AvailableActions);
}

void DocumentListController::startSearchWithQueryStringBecomeFirstResponder(const std::string& query,
                                                                            bool becomeFirstResponder) {
  if (const auto search = std::dynamic_pointer_cast<SearchController>(presentedViewController())) {
    search->setQuery(query, becomeFirstResponder);
  } else {
    presentViewController(std::make_shared<SearchController>(self(), query, becomeFirstResponder), true);
  }
  listChanged_.emit(*this, DocumentListChange::Search);
}

void DocumentListController::runScrollTest(const std::string& name, int iterations, int delta, int listMode) {
  if (scrollTest_) scrollTest_(name, iterations, delta, listMode);
}

void DocumentListController::setAttachment(const std::string& key, std::shared_ptr<void> object) {
  if (object) {
    attachments_[key] = std::move(object);
  } else {
    attachments_.erase(key);
  }
}

std::shared_ptr<void> DocumentListController::attachment(const std::string& key) const {
  const auto found = attachments_.find(key);
  return found == attachments_.end() ? nullptr : found->second;
}

void DocumentListController::itemsLoaded(URLList items) {
  containedItems_ = std::move(items);
  selectedItems_ = containedItems_.thoseOf(selectedItems_);
  listChanged_.emit(*this, DocumentListChange::Items);
  if (const auto told = delegate()) told->documentListControllerItemsChanged(self());
}

void DocumentListController::folderMoved(const URL& url) {
  presentedURL_ = url;
  listChanged_.emit(*this, DocumentListChange::Items);
}

void DocumentListController::folderWasRemoved() {
  if (const auto told = delegate()) told->documentListControllerURLWasRemoved(self());
}

void DocumentListController::userSelectedContainer(const DocumentListControllerRef& chosen) {
  if (const auto told = delegate()) told->documentListControllerDidSelectContainerWithViewController(self(), chosen);
}

void DocumentListController::userSelectedItem(const URL& url) {
  if (const auto told = delegate()) told->documentListControllerDidSelectItemAtURL(self(), url);
}

void DocumentListController::userChoseAction(int action, const URL& url, const ViewRef& view,
                                             std::function<void()> completion) {
  if (const auto told = delegate()) {
    told->documentListControllerPerformActionURLOriginatingViewCompletion(self(), action, url, view, std::move(completion));
  } else if (completion) {
    completion();
  }
}

ViewControllerRef DocumentListController::viewControllerForPreviewing(const URL& url) {
  const auto told = delegate();
  return told ? told->documentListControllerViewControllerForPreviewingItemAtURL(self(), url) : nullptr;
}

}  // namespace vaelo
