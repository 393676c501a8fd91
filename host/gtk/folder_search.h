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
  /// What was found since the last report.
  struct Report {
    std::vector<FolderEntry> entries;
    /// Folders that were passed over, each with the system's reason.
    std::vector<std::pair<std::string, std::string>> unreadable;
    bool finished = false;
  };
  using Found = std::function<void(Report)>;
  FolderSearch() = default;
  ~FolderSearch() { stop(); }
  FolderSearch(const FolderSearch&) = delete;
  FolderSearch& operator=(const FolderSearch&) = delete;

  /// Ends an earlier search. Names match that hold the query, without regard to case and accents' composition. At most some
  /// thousand items are reported.
  void start(std::vector<std::string> folders, const std::string& query, Found found);
  void stop();

 private:
  std::shared_ptr<std::atomic<bool>> stopped_;
};

}  // namespace vaelo
