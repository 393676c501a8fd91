// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <string>

#include "host/gtk/preview/file_version.h"
#include "host/support/unique_fd.h"
#include "platform/file_coordinator.h"

namespace vaelo {

/// Puts a document with marks in the place of the one that was marked, when that is still what it was; else beside it, so
/// that neither the marks nor what somebody else wrote is lost. Blocks; any thread.
class MarkedFile {
 public:
  enum class Outcome { Replaced, Beside, Failed };
  struct Result {
    Outcome outcome = Outcome::Failed;
    std::string path;     ///< where the marked document is now
    std::string reason;   ///< why it failed, for a person; may be empty
    UniqueFd file;        ///< the marked document
    FileVersion version;  ///< of it
  };

  /// `path` is where the document was opened, `current` the open file with its last saved content, which is followed when it
  /// was moved, and `expected` the version of that. `original` is the document without marks, with which a marked one
  /// begins. `coordination` may be null. The files outlive this object.
  MarkedFile(std::string path, int current, const FileVersion& expected, int original, FileCoordination* coordination)
      : path_(std::move(path)), current_(current), expected_(expected), original_(original), coordination_(coordination) {}
  /// `marked` is the whole content. It is written to a file of another name and flushed, which then takes the document's
  /// name; whatever fails, the document stays as it was and nothing else is left behind.
  Result save(int marked);

 private:
  Result put(int marked, const std::string& path);
  bool isStillThere(const std::string& path) const;
  void copyAttributes(int to, bool withOwner) const;

  std::string path_;
  int current_;
  FileVersion expected_;
  int original_;
  FileCoordination* coordination_;
};

/// "NAME (marked).pdf", or with a number, of at most 255 bytes.
std::string markedCopyName(const std::string& name, int number);

}  // namespace vaelo
