// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <glib.h>

#include <functional>
#include <string>
#include <unordered_set>
#include <vector>

namespace vaelo {

/// What happened in a folder since the last report.
struct FolderChanges {
  std::vector<std::string> names;  ///< items that came, went or changed; promises by the name of their item
  bool everything = false;         ///< too much happened to name it: read the folder again
};

/// Tells what other programs do to one folder. Main thread.
///
/// Changes are gathered for a tenth of a second and reported at once, however many there are. Reading the kernel's queue is
/// bounded a turn of the main loop, so that a storm doesn't block it.
class FolderMonitor {
 public:
  FolderMonitor() = default;
  ~FolderMonitor();
  FolderMonitor(const FolderMonitor&) = delete;
  FolderMonitor& operator=(const FolderMonitor&) = delete;

  /// Watches from now on: start before the folder is read, so that nothing is missed in between. A folder that can't be
  /// watched changes nothing silently, as on some network mounts. `removed` also stands for moved away.
  void start(const std::string& folder, std::function<void(FolderChanges)> changed, std::function<void()> removed);
  void stop();

 private:
  void read();
  void report();

  int queue_ = -1;
  guint source_ = 0;
  guint timer_ = 0;
  std::unordered_set<std::string> names_;
  bool everything_ = false;
  std::function<void(FolderChanges)> changed_;
  std::function<void()> removed_;
};

}  // namespace vaelo
