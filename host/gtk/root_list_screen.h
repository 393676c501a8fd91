// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include "host/gtk/folder_list_screen.h"
#include "host/gtk/list/folder_monitor.h"
#include "host/gtk/list/worker.h"

namespace vaelo {

/// The root of the drive: the content of the drive's own folder, and the app libraries with their names. Main thread.
class RootListScreen : public FolderListScreen {
 public:
  RootListScreen(const URL& folder, CloudDocuments& drive, ScreenFactory& screens, DriveSyncedStore& tags)
      : FolderListScreen(folder, drive, screens, tags, true) {}
  void refresh() override { read(); }

 protected:
  void fill() override;
  URL urlOf(const std::string& name) const override { return URL(name); }
  URLList shownItems() override;
  std::vector<FolderSearch::Folder> searchedFolders() const override;

 private:
  void follow();
  void read();
  std::vector<FolderEntry> libraries() const;

  FolderMonitor ownFolder_;
  FolderMonitor mirror_;
  bool unreadable_ = false;
  Worker worker_;
};

}  // namespace vaelo
