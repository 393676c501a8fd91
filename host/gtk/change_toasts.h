// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <adwaita.h>

#include <memory>

#include "host/drive/local_cloud_documents.h"
#include "host/files/move_history.h"

namespace vaelo {

class GtkScreens;

/// The short messages about what was changed: what moved, with Undo, and how far the removal of a large folder is, with
/// Cancel. Main thread.
class ChangeToasts {
 public:
  /// All outlive it.
  ChangeToasts(GtkScreens& screens, LocalCloudDocuments& drive, MoveHistory& moves);
  ~ChangeToasts();
  ChangeToasts(const ChangeToasts&) = delete;
  ChangeToasts& operator=(const ChangeToasts&) = delete;

 private:
  void offerUndo(const std::shared_ptr<const MoveHistory::Batch>& batch);
  void undo(const MoveHistory::Batch& batch);
  void removalWent(const TreeRemovals::News& news);
  std::string textFor(const MoveHistory::Batch& batch) const;
  std::string folderName(const URL& folder) const;
  void say(const std::string& text);

  GtkScreens& screens_;
  LocalCloudDocuments& drive_;
  MoveHistory& moves_;
  AdwToast* undo_ = nullptr;     // weak pointer
  AdwToast* removal_ = nullptr;  // weak pointer
  AdwToast* told_ = nullptr;     // how the latest removal ended; weak pointer
};

}  // namespace vaelo
