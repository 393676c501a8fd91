// SPDX-License-Identifier: GPL-3.0-or-later
#include "platform/ui/document_list_controller.h"

#include <numeric>
#include <utility>

#include "platform/ui/search_controller.h"

namespace vaelo {

DocumentListController::DocumentListController(std::optional<URL> presentedURL, bool allContainers)
    : presentedURL_(std::move(presentedURL)), allContainers_(allContainers) {}

DocumentListController::~DocumentListController() = default;

DocumentListControllerRef DocumentListController::self() { return sharedSelf(this); }

const std::vector<URL>& DocumentListController::selectedItems() const {
  if (!selectedItems_) {
    selectedItems_.emplace();
    selectedItems_->reserve(selection_.size());
    for (const std::size_t place : selection_) selectedItems_->push_back(containedItems_[place]);
  }
  return *selectedItems_;
}

std::vector<URL> DocumentListController::selectedItemsUnless(const std::function<bool(ItemHint)>& isKnown) const {
  std::vector<URL> items;
  for (const std::size_t place : selection_) {
    if (!isKnown(containedItems_.hint(place))) items.push_back(containedItems_[place]);
  }
  return items;
}

std::vector<URL> DocumentListController::selectedItemsThatMayBeFolders() const {
  return selectedItemsUnless([](ItemHint hint) { return hint == ItemHint::Document; });
}

std::vector<URL> DocumentListController::selectedItemsThatMayBeSpecial() const {
  return selectedItemsUnless([](ItemHint hint) { return hint != ItemHint::Unknown; });
}

void DocumentListController::setSelectedItems(const std::vector<URL>& items) { select(containedItems_.placesOf(items)); }

void DocumentListController::selectAllItems() {
  std::vector<std::size_t> places(containedItems_.size());
  std::iota(places.begin(), places.end(), std::size_t{0});
  select(std::move(places));
}

void DocumentListController::userSelected(std::vector<std::size_t> places) { select(std::move(places)); }

void DocumentListController::select(std::vector<std::size_t> places) {
  if (places == selection_) return;
  selection_ = std::move(places);
  selectedItems_.reset();
  listChanged_.emit(*this, DocumentListChange::Selection);
  if (const auto told = delegate()) told->documentListControllerItemsChanged(self());
}

void DocumentListController::setEditingAnimated(bool editing, bool) {
  if (editing_ == editing) return;
  editing_ = editing;
  if (!editing && !selection_.empty()) {
    selection_.clear();
    selectedItems_.reset();
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
  const std::vector<URL> selected = selectedItems();
  containedItems_ = std::move(items);
  selection_ = containedItems_.placesOf(selected);
  selectedItems_.reset();
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
