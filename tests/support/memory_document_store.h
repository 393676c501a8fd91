// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <map>
#include <set>

#include "platform/document_store.h"
#include "tests/support/call_record.h"
#include "tests/support/memory_disk.h"

namespace vaelo {

/// Finds documents of a disk in memory: the file identifier is the document's.
class MemoryDocumentStore : public DocumentStore {
 public:
  MemoryDocumentStore(MemoryDisk& disk, CallRecord& record) : disk_(disk), record_(record) {}

  // Answers that a test wants instead of the disk's.
  std::optional<Device> device = 5;
  std::optional<SystemResult<FileID>> resolvedFile;
  std::optional<SystemResult<int>> openedHandle;
  std::optional<SystemResult<OpenFileAttributes>> openAttributes;
  std::set<Device> devices;  ///< that were asked

  std::optional<Device> deviceOf(const URL& folder) override;
  SystemResult<FileID> resolveDocumentID(Device device, std::uint64_t documentID) override;
  SystemResult<int> openByID(Device device, FileID file) override;
  SystemResult<OpenFileAttributes> attributesOfOpenFile(int handle) override;
  void close(int handle) override;

 private:
  MemoryDisk& disk_;
  CallRecord& record_;
  std::map<int, std::int64_t> open_;  // document by handle
};

}  // namespace vaelo
