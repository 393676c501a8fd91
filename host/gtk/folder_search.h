// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <atomic>
#include <functional>
#include <memory>
#include <string>
#include <vector>

#include "host/gtk/list/folder_model.h"

namespace vaelo {

/// Looks for items by name below a folder, on a thread of its own. Names alone are read, never content; links are not
/// followed. Main thread.
class FolderSearch {
 public:
  struct Report {
    /// All that was found so far, in the order of a list; those of one name, by their paths.
    std::vector<FolderEntry> entries;
    /// Folders that were passed over since the last report, each with the system's reason.
    std::vector<std::pair<std::string, std::string>> unreadable;
    bool finished = false;
  };
  /// A folder to look into, and what a person calls it; empty for the one that is open.
  struct Folder {
    std::string path;
    std::string name;
  };
  using Found = std::function<void(Report)>;
  FolderSearch() = default;
  ~FolderSearch() { stop(); }
  FolderSearch(const FolderSearch&) = delete;
  FolderSearch& operator=(const FolderSearch&) = delete;

  /// Ends an earlier search. Names match that hold the query, without regard to case and accents' composition, those of the
  /// folders as well. Each item is told with the folders that lead to it. At most some thousand items are reported.
  void start(std::vector<Folder> folders, const std::string& query, Found found);
  void stop();

 private:
  std::shared_ptr<std::atomic<bool>> stopped_;
};

}  // namespace vaelo
