// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <string>

#include "platform/file_progress.h"

namespace vaelo {

/// The progress of documents on their way into the drive, between processes: who downloads DIR/NAME writes what has come to
/// partialPathFor(DIR/NAME) and renames that to NAME when all is there, then removes the promise. How far it is follows from
/// the partial file's size and the size that the promise names, so a download that crashed leaves nothing that could lie.
///
/// A subscriber hears of a document while it is not downloaded: a progress is published when there is a partial file,
/// changes at most every 50 ms, and is withdrawn when the partial file goes. When the document is there, also at one stroke,
/// a progress that is complete is told first. Nothing is published during subscribe() itself. Main thread.
class DriveFileProgress : public FileProgress {
 public:
  std::shared_ptr<void> subscribe(const URL& url, Published published) override;
  /// Where what has come of the document is kept until it is whole.
  static std::string partialPathFor(const std::string& logicalPath);
};

}  // namespace vaelo
