// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/drive/local_document_store.h"

#include <fcntl.h>
#include <glib.h>
#include <limits.h>
#include <sys/stat.h>
#include <unistd.h>

#include <cerrno>

#include "host/drive/item_identity.h"
#include "host/drive/promise_file.h"

namespace vaelo {

namespace {

template <typename T>
SystemResult<T> failure(int number) {
  return {std::nullopt, {number, g_strerror(number)}};
}

int errnoFor(const Error& error) { return error.code == FileErrorCode::NoSuchFile ? ENOENT : EIO; }

}  // namespace

std::optional<DocumentStore::Device> LocalDocumentStore::deviceOf(const URL& folder) {
  struct stat status = {};
  if (::stat(folder.path().c_str(), &status) != 0) return std::nullopt;
  return status.st_dev;
}

SystemResult<DocumentStore::FileID> LocalDocumentStore::resolveDocumentID(Device device, std::uint64_t documentID) {
  if (documentID > static_cast<std::uint64_t>(INT64_MAX)) return failure<FileID>(ENOENT);
  const Result<IndexedDocument> found = index_.resolve(static_cast<std::int64_t>(documentID));
  if (!found) return failure<FileID>(errnoFor(*found.error));
  if (found.value->device != device) return failure<FileID>(ESTALE);
  return {found.value->inode, {}};
}

SystemResult<int> LocalDocumentStore::openByID(Device device, FileID file) {
  const Result<IndexedDocument> found = index_.documentWithInode(device, file);
  if (!found) return failure<int>(errnoFor(*found.error));
  const int handle = ::open(found.value->path.c_str(), O_RDONLY | O_NOFOLLOW | O_NONBLOCK | O_NOCTTY | O_CLOEXEC);
  if (handle < 0) return failure<int>(errno);
  struct stat status = {};
  if (::fstat(handle, &status) != 0 || status.st_dev != device || status.st_ino != file) {
    ::close(handle);
    return failure<int>(ESTALE);
  }
  return {handle, {}};
}

SystemResult<DocumentStore::OpenFileAttributes> LocalDocumentStore::attributesOfOpenFile(int handle) {
  struct stat status = {};
  if (::fstat(handle, &status) != 0) return failure<OpenFileAttributes>(errno);
  if (status.st_nlink == 0) return failure<OpenFileAttributes>(ENOENT);
  char path[PATH_MAX];
  const ssize_t length = ::readlink(("/proc/self/fd/" + std::to_string(handle)).c_str(), path, sizeof path);
  if (length <= 0) return failure<OpenFileAttributes>(length < 0 ? errno : ENOENT);
  OpenFileAttributes attributes;
  attributes.path.assign(path, static_cast<std::size_t>(length));
  const std::optional<ItemIdentity> item = identityOfOpenFile(handle, attributes.path);
  if (!item) return failure<OpenFileAttributes>(errno);
  attributes.documentID = item->carriedID;
  if (attributes.documentID == 0) {
    // File systems without attributes: the index alone knows.
    const Result<IndexedDocument> known = index_.documentWithInode(item->device, item->inode);
    if (!known) return failure<OpenFileAttributes>(ENODATA);
    attributes.documentID = known.value->id;
  }
  if (const std::optional<std::string> logical = logicalNameOf(attributes.path)) attributes.path = *logical;
  return {attributes, {}};
}

void LocalDocumentStore::close(int handle) { ::close(handle); }

}  // namespace vaelo
