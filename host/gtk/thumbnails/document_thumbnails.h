// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <functional>
#include <memory>
#include <mutex>
#include <set>
#include <string>

#include "host/gtk/thumbnails/thumbnail_cache.h"
#include "platform/image.h"
#include "platform/queues.h"

namespace vaelo {

/// The large thumbnails of documents that are looked at one by one: from the desktop's cache, and made for it by a worker
/// when they are missing. Safe from any thread; destruction waits for the thumbnailer that runs.
class DocumentThumbnails {
 public:
  /// `made` is told, on any thread, of the path whose thumbnail is there now.
  DocumentThumbnails(Queues& queues, std::function<void(const std::string& path)> made);

  /// The thumbnail of 1024 pixels, or what there is of it. Null for none; one that can be made is made then. Reads the
  /// cache; a large one is decoded by a thread while it is laid out.
  ImageRef thumbnailOf(const std::string& path);

 private:
  ImageRef comingPicture(const std::string& path, ThumbnailFile file);
  bool isDamaged(const std::string& path);
  void foundDamaged(const std::string& path);
  void make(const std::string& path);

  const std::function<void(const std::string&)> made_;
  std::mutex mutex_;
  std::set<std::string> making_;           // guarded by mutex_
  std::set<std::string> damaged_;          // guarded by mutex_; whose large ones can't be decoded
  std::shared_ptr<OperationQueue> maker_;  // these last, so that they end before what their operations use
  std::shared_ptr<OperationQueue> decoder_;
};

}  // namespace vaelo
