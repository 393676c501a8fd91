// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <glib.h>

#include <functional>
#include <memory>
#include <string>
#include <vector>

#include "host/gtk/list/worker.h"
#include "host/gtk/preview/archive_listing.h"
#include "host/gtk/preview/decoder_process.h"

namespace vaelo {

/// Lists an archive in a decoder's process, and makes folders of it on a thread of its own. Main thread.
class ArchiveLoad {
 public:
  enum class End { Whole, Full, Broken, Slow };
  struct Events {
    std::function<void(std::shared_ptr<const ArchiveListing> listing, End end)> listed;
    std::function<void(const std::string& error)> failed;  ///< a word of DecoderError
    std::function<void(int entries)> progress;             ///< so many are listed, and there are more
  };

  /// `single`: no archive, but one compressed document. `unnamed` as ArchiveListing takes it. No event comes before the
  /// constructor returned, nor after the object is gone.
  ArchiveLoad(const std::string& path, bool single, const std::string& unnamed, Events events);
  ArchiveLoad(const ArchiveLoad&) = delete;
  ArchiveLoad& operator=(const ArchiveLoad&) = delete;

 private:
  void askForMore();
  void received(DecoderProcess::Answer answer);
  void finish(End end);

  Events events_;
  std::string unnamed_;
  std::unique_ptr<DecoderProcess> process_;
  Worker worker_;
  std::vector<std::shared_ptr<GBytes>> lines_;
  int entries_ = 0;
  gint64 until_;
};

}  // namespace vaelo
