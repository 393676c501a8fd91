// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <memory>
#include <optional>
#include <string>

#include "host/gtk/folder_search.h"
#include "host/gtk/host_screen.h"
#include "host/gtk/list/folder_view.h"
#include "host/gtk/view_mode_switch.h"
#include "platform/cloud_documents.h"
#include "platform/ui/document_list_controller.h"
#include "platform/ui/screen_factory.h"
#include "platform/ui/search_controller.h"

namespace vaelo {

class DriveSyncedStore;

/// The list of one folder: its rows, and the search below it. Main thread.
class FolderListScreen : public DocumentListController, public HostScreen {
 public:
  FolderListScreen(const URL& folder, CloudDocuments& drive, ScreenFactory& screens, DriveSyncedStore& tags,
                   bool allContainers = false);
  ~FolderListScreen() override;

  GtkWidget* contentWidget() override;
  std::vector<GtkWidget*> headerWidgets(bool narrow) override;
  GActionGroup* narrowActions() override { return viewMode_.actions(); }
  const char* narrowIcon(const BarButtonItem& item) override;
  bool toggleSearch() override;
  bool closeSearch() override;
  void refresh() override { folderView().refresh(); }
  void takeFocus() override;
  void itemMoved(const URL& from, const URL& to) override { folderView().itemMoved(from.path(), to.path()); }
  void cameBackFrom(const URL& item) override { folderView().setKeyboardItem(item.path()); }
  void showSearch(const std::shared_ptr<SearchController>& search) override;
  void hideSearch() override;

 protected:
  FolderView& folderView();
  /// Begins to show the items; the folder's own unless a subclass knows better.
  virtual void fill();
  /// The URL that a row's name stands for.
  virtual URL urlOf(const std::string& name) const;
  /// The items of all rows, in their order.
  virtual URLList shownItems();
  /// Where a search looks.
  virtual std::vector<FolderSearch::Folder> searchedFolders() const;
  void reportItems();
  /// What the list knows of an entry of a folder within a library.
  static ItemHint hintFor(EntryKind kind, std::string_view name);
  CloudDocuments& drive() const { return drive_; }

 private:
  void build();
  /// The row `name` of `view`, which stands for `url`.
  void activated(FolderView& view, const std::string& name, const URL& url);
  /// The menu of an item; `row` names its row in the folder's own list, where several can be selected.
  void offerActions(const URL& url, const std::optional<std::string>& row, GtkWidget* over, const GdkRectangle& at);
  bool offers(ListCommand command) const;
  void beginSelecting(const std::string& row);
  void reportSelection();
  void perform(int action, const URL& url, GtkWidget* over, const GdkRectangle& at);
  void commanded(ListCommand command, const URL& url, GtkWidget* over, const GdkRectangle& at);
  /// Keeps check marks and selection in step with the model.
  void followEditing(DocumentListChange change);
  void queryTyped();
  void beginSearch();

  CloudDocuments& drive_;
  ScreenFactory& screens_;
  DriveSyncedStore& tags_;
  ViewModeSwitch viewMode_;
  std::unique_ptr<FolderView> view_;
  std::unique_ptr<FolderView> results_;
  GtkWidget* content_ = nullptr;
  GtkWidget* searchBar_ = nullptr;
  GtkWidget* searchEntry_ = nullptr;
  GtkWidget* stack_ = nullptr;
  unsigned reportedRevision_ = 0;  ///< of the rows that reportItems() told last
  FolderSearch folderSearch_;
  std::shared_ptr<SearchController> search_;
  std::shared_ptr<void> queryToken_;
  std::shared_ptr<void> editingToken_;
  std::shared_ptr<View> anchor_;  ///< of the latest item action
};

}  // namespace vaelo
