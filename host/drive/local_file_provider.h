// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <memory>

#include "host/drive/document_index.h"
#include "host/drive/drive_layout.h"
#include "platform/file_provider.h"
#include "platform/queues.h"

namespace vaelo {

/// Bookmarkable strings: "vlo1:", the document identifier, ":" and the percent-encoded path below the mirror. The identifier
/// finds a document that was moved, the path one on a device that gave it another identifier. Strings come from other
/// devices and are not trusted: what they lead to is in the mirror or an error. The work is done by a worker.
class LocalFileProvider : public FileProvider {
 public:
  LocalFileProvider(const DriveLayout& layout, DocumentIndex& index, Queues& queues);

  /// Errors: CloudDocumentsErrorDomain code 7 outside the mirror, FileErrorCode::NoSuchFile when nothing is there.
  void BookmarkableStringFromDocumentURL(const URL& url, std::function<void(Result<std::string>)> done) override;
  /// Errors: FileErrorCode::Formatting for a string of another make, FileErrorCode::NoSuchFile when neither identifier nor
  /// path leads to a document in the mirror.
  void DocumentURLFromBookmarkableString(const std::string& text, std::function<void(Result<URL>)> done) override;

 private:
  Result<std::string> encoded(const URL& url);
  Result<URL> decoded(const std::string& text);

  const DriveLayout& layout_;
  DocumentIndex& index_;
  std::shared_ptr<OperationQueue> workers_;  // last, so that it ends before what its operations use
};

}  // namespace vaelo
