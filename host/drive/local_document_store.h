// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include "host/drive/document_index.h"
#include "platform/document_store.h"

namespace vaelo {

/// The document store on the document index. A file identifier is an inode number. Of an item that is not downloaded its
/// promise is opened, and its attributes are those of the item, under its logical path. Keeps nothing, so needs no lock.
class LocalDocumentStore : public DocumentStore {
 public:
  explicit LocalDocumentStore(DocumentIndex& index) : index_(index) {}

  std::optional<Device> deviceOf(const URL& folder) override;
  /// ENOENT for an identifier that nothing has, ESTALE for a document on another device.
  SystemResult<FileID> resolveDocumentID(Device device, std::uint64_t documentID) override;
  /// ELOOP for a link, ESTALE when another file stands where the document was.
  SystemResult<int> openByID(Device device, FileID file) override;
  /// ENOENT for a file that was deleted since, ENODATA for one without an identifier.
  SystemResult<OpenFileAttributes> attributesOfOpenFile(int handle) override;
  void close(int handle) override;

 private:
  DocumentIndex& index_;
};

}  // namespace vaelo
