// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <functional>
#include <string>

#include "platform/result.h"

namespace vaelo {

/// Turns a document's URL into a string that another device can turn back. `done` comes once, on any thread; both forms may
/// touch the disk and never block the caller.
class FileProvider {
 public:
  virtual ~FileProvider() = default;
  /// Error: CloudDocumentsErrorDomain code 7 when the document is not in the drive.
  virtual void BookmarkableStringFromDocumentURL(const URL& url, std::function<void(Result<std::string>)> done) = 0;
  virtual void DocumentURLFromBookmarkableString(const std::string& text, std::function<void(Result<URL>)> done) = 0;
};

}  // namespace vaelo
