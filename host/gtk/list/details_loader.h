// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <functional>
#include <string>
#include <vector>

#include "host/gtk/list/content_monitor.h"
#include "host/gtk/list/folder_model.h"
#include "host/gtk/list/worker.h"

namespace vaelo {

/// Fills in the details of the rows that are seen. Main thread.
///
/// Rows ask when they are drawn. The names go to a worker in small batches, the ones asked for last first, since they are
/// what is on screen now; a row that shows something else by the time its turn comes costs nothing. Thumbnails that are
/// missing are made by another worker, one at a time, likewise: a thumbnailer may take long, and texts do not wait for it.
/// Folders whose items were counted are watched, and counted again when items come or go.
class DetailsLoader {
 public:
  /// `loaded` is called for each item whose details came.
  DetailsLoader(FolderModel& model, std::function<void(FolderItem&)> loaded);

  /// The folder of the names; empty where names are paths. What is on its way for another folder is dropped.
  void setFolder(const std::string& folder);
  void setThumbnailPixels(int pixels) { thumbnailPixels_ = pixels; }
  /// Watches no folders until details are requested again, for which all are to be old then.
  void rest() { contents_.stop(); }
  /// Does nothing when the details are fresh or already asked for.
  void request(FolderItem& item);

 private:
  void readNext();
  void makeNextThumbnail();
  void contentChanged(const std::string& name);
  FolderItem* shownItem(const std::string& name);

  FolderModel& model_;
  std::function<void(FolderItem&)> loaded_;
  std::string folder_;
  int thumbnailPixels_ = 48;
  unsigned generation_ = 0;
  bool reading_ = false;
  bool making_ = false;
  std::vector<std::string> wanted_;
  std::vector<std::string> missing_;  // thumbnails
  ContentMonitor contents_;
  Worker worker_;
  Worker maker_;
};

}  // namespace vaelo
