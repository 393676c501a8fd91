// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <adwaita.h>

#include <memory>
#include <string>
#include <vector>

#include "fileops/new_folder_prompt.h"
#include "host/gtk/list/folder_view.h"
#include "host/gtk/list/worker.h"
#include "host/gtk/move_targets.h"
#include "platform/ui/document_target_selection_controller.h"

namespace vaelo {

/// The window in which the user walks to the folder that items are to move to. It lives while its picker is presented. Main
/// thread.
class FolderPicker : public std::enable_shared_from_this<FolderPicker> {
 public:
  /// `over` is the window that it belongs to.
  FolderPicker(std::shared_ptr<DocumentTargetSelectionController> picker, CloudDocuments& drive, GtkWindow* over);
  ~FolderPicker();
  FolderPicker(const FolderPicker&) = delete;
  FolderPicker& operator=(const FolderPicker&) = delete;

  GtkWindow* window() const { return GTK_WINDOW(window_); }

 private:
  void build(GtkWindow* over);
  void goTo(const URL& folder);
  void goUp();
  void show(const URL& folder, MoveTarget target);
  /// Says below the folders why nothing is moved; empty for nothing.
  void refuse(const std::string& reason);
  void choose();
  void askForNewFolder();
  std::string makeFolder(const std::string& name, bool& accepted);
  std::string titleOf(const URL& folder) const;
  std::string invitation() const;
  std::string nameOfItem() const;

  std::shared_ptr<DocumentTargetSelectionController> picker_;
  CloudDocuments& drive_;
  std::vector<URL> way_;  ///< the folders down to the one that shows, or is about to
  bool shown_ = false;    ///< the last of them is what shows
  GtkWidget* window_ = nullptr;
  GtkWidget* back_ = nullptr;
  GtkWidget* title_ = nullptr;
  GtkWidget* move_ = nullptr;
  GtkWidget* newFolder_ = nullptr;
  GtkWidget* refusal_ = nullptr;
  std::shared_ptr<NewFolderPrompt> prompt_;  ///< the latest
  FolderView view_;
  Worker worker_;
};

}  // namespace vaelo
