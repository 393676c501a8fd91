// SPDX-License-Identifier: GPL-3.0-or-later
#include "tests/support/memory_document_store.h"

#include <cerrno>

namespace vaelo {

std::optional<DocumentStore::Device> MemoryDocumentStore::deviceOf(const URL& folder) {
  record_.calls.push_back("deviceOf " + folder.path());
  if (!disk_.hasFolder(folder.path()) && !disk_.physicalItem(folder.path())) return std::nullopt;
  return device;
}

SystemResult<DocumentStore::FileID> MemoryDocumentStore::resolveDocumentID(Device on, std::uint64_t documentID) {
  devices.insert(on);
  record_.calls.push_back("resolve " + std::to_string(documentID));
  if (resolvedFile) return *resolvedFile;
  if (on != device) return {std::nullopt, {ESTALE, "Stale file handle"}};
  if (!disk_.pathOfDocument(static_cast<std::int64_t>(documentID))) return {std::nullopt, {ENOENT, "No such file"}};
  return {documentID, {}};
}

SystemResult<int> MemoryDocumentStore::openByID(Device on, FileID file) {
  devices.insert(on);
  record_.calls.push_back("openByID " + std::to_string(file));
  if (openedHandle) return *openedHandle;
  if (on != device) return {std::nullopt, {ENOENT, "No such file"}};
  if (!disk_.pathOfDocument(static_cast<std::int64_t>(file))) return {std::nullopt, {ENOENT, "No such file"}};
  int handle = 3;
  while (open_.contains(handle)) ++handle;
  open_[handle] = static_cast<std::int64_t>(file);
  return {handle, {}};
}

SystemResult<DocumentStore::OpenFileAttributes> MemoryDocumentStore::attributesOfOpenFile(int handle) {
  record_.calls.push_back("attributes " + std::to_string(handle));
  if (openAttributes) return *openAttributes;
  const auto found = open_.find(handle);
  if (found == open_.end()) return {std::nullopt, {EBADF, "Bad file descriptor"}};
  const std::optional<std::string> path = disk_.pathOfDocument(found->second);
  if (!path) return {std::nullopt, {ENOENT, "No such file"}};
  return {OpenFileAttributes{found->second, *path}, {}};
}

void MemoryDocumentStore::close(int handle) {
  record_.calls.push_back("close " + std::to_string(handle));
  open_.erase(handle);
}

}  // namespace vaelo
