// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <chrono>
#include <cstdint>
#include <functional>
#include <mutex>
#include <optional>
#include <string>
#include <unordered_map>

#include "host/drive/document_database.h"
#include "host/drive/drive_layout.h"
#include "host/drive/item_identity.h"
#include "platform/logging.h"
#include "platform/result.h"

namespace vaelo {

/// A document that the index knows, where it stands now.
struct IndexedDocument {
  std::int64_t id = 0;
  std::string path;  ///< physical: a promise's own path while the item is not downloaded
  std::uint64_t device = 0;
  std::uint64_t inode = 0;
};

/// Document identifiers, which stay with a document when it is renamed or moved, by this program or another.
///
/// The item itself carries its identifier (extended attribute, or in its promise); the database remembers where it was seen
/// last, and alone holds the identifiers of items that can carry none (links, file systems without attributes), told apart
/// by device, inode and time of birth. So a lost or damaged database costs a walk of the mirror, not the identifiers.
///
/// Blocking; safe from any thread. The database is opened by the first call. Errors are those of FileManager: 640 for a full
/// disk, 642 read-only, 513 no permission, 512 anything else the database says.
class DocumentIndex {
 public:
  /// `rebuilt` is told, on any thread, when a damaged database was replaced; it must not call the index.
  /// `walksAgainAfter`: for how long a walk in vain stands for the next one.
  DocumentIndex(const DriveLayout& layout, LogSink& log, std::function<void()> rebuilt = {},
                std::chrono::milliseconds walksAgainAfter = std::chrono::seconds(1));

  /// Opens the database, makes it when there is none, and moves a damaged one aside and rebuilds it.
  std::optional<Error> open() { return database_.open(); }
  /// The identifier of the item at `path` (logical or physical, final link not followed), above 0; one is made when it has
  /// none and `create` is true, else 0. A copy that another program made with its attributes gets an identifier of its own
  /// while the original exists. Error 4 when nothing is there.
  Result<std::int64_t> documentIDFor(const std::string& path, bool create);
  /// Where the document is now: where it was seen last, else the mirror is walked for it, unless that was just done in vain:
  /// whoever must not wait asks after a worker has asked. Error 4 when it is nowhere.
  Result<IndexedDocument> resolve(std::int64_t id);
  /// The document with that inode, as last seen; error 4 when it is not known.
  Result<IndexedDocument> documentWithInode(std::uint64_t device, std::uint64_t inode);
  /// True once a damaged database was moved aside and rebuilt since the program started.
  bool wasRebuilt() const { return database_.wasRebuilt(); }

 private:
  Result<std::int64_t> makeID(const std::string& path, bool replacing);
  Result<std::int64_t> carriedIDOf(const std::string& path, const ItemIdentity& item, bool create);
  /// The item that `row` is about where it stands now; nothing when it is neither at its place nor in the mirror.
  std::optional<IndexedDocument> locate(const DocumentRow& row);
  bool wasSoughtInVain(std::int64_t id);
  void noteSoughtInVain(std::int64_t id);

  const DriveLayout& layout_;
  LogSink& log_;
  DocumentDatabase database_;  // has its own lock; none is held while the mirror is walked
  const std::chrono::milliseconds walksAgainAfter_;
  std::mutex mutex_;
  std::unordered_map<std::int64_t, std::chrono::steady_clock::time_point> soughtInVain_;  // guarded by mutex_
};

}  // namespace vaelo
