// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <cstdint>
#include <functional>
#include <mutex>
#include <optional>
#include <string>
#include <vector>

#include "platform/logging.h"
#include "platform/result.h"

struct sqlite3;

namespace vaelo {

/// What the database remembers of a document.
struct DocumentRow {
  std::int64_t id = 0;
  std::uint64_t device = 0;
  std::uint64_t inode = 0;
  std::int64_t born = 0;  ///< see ItemIdentity
  std::string path;       ///< physical, absolute
  bool carried = true;    ///< the item itself carries the identifier too
};

/// The table of documents: SQLite in WAL mode, so that a crash loses no more than the last rows and several processes may
/// use it. A damaged database is moved aside to FILE.damaged-N and filled anew. Blocking; safe from any thread; opened by
/// the first call. Errors as those of DocumentIndex.
class DocumentDatabase {
 public:
  /// `remembered` gives the rows to fill a new database with after damage; `rebuilt`, which may be empty, is told that it
  /// was done. Both are called under the lock, so they must not call back.
  DocumentDatabase(std::string file, LogSink& log, std::function<std::vector<DocumentRow>()> remembered,
                   std::function<void()> rebuilt);
  ~DocumentDatabase();
  DocumentDatabase(const DocumentDatabase&) = delete;
  DocumentDatabase& operator=(const DocumentDatabase&) = delete;

  std::optional<Error> open();
  bool wasRebuilt() const;

  /// The row, or neither row nor error.
  Result<DocumentRow> withID(std::int64_t id);
  /// All rows with the inode; several when it was given out again.
  Result<std::vector<DocumentRow>> withInode(std::uint64_t device, std::uint64_t inode);
  /// Adds the row unless its identifier or its item is there already; false when it is.
  Result<bool> add(const DocumentRow& row);
  /// Writes the row in place of those with the same identifier or item.
  std::optional<Error> put(const DocumentRow& row);
  std::optional<Error> remove(std::int64_t id);

 private:
  class Statement;

  std::optional<Error> openLocked();
  int tryOpen();
  std::optional<Error> rebuild();
  /// Returns 0 or the error number.
  int moveAside();
  void close();
  Error errorFor(int status) const;
  /// Runs `work`, which returns a SQLite status, and once more on a rebuilt database when that one turns out to be damaged.
  std::optional<Error> run(const std::function<int()>& work);
  int read(const char* where, const std::function<void(Statement&)>& bind, std::vector<DocumentRow>& rows);
  int write(const char* verb, const DocumentRow& row);

  const std::string file_;
  LogSink& log_;
  const std::function<std::vector<DocumentRow>()> remembered_;
  const std::function<void()> rebuilt_;
  mutable std::mutex mutex_;
  sqlite3* connection_ = nullptr;  // guarded by mutex_
  bool wasRebuilt_ = false;        // guarded by mutex_
};

}  // namespace vaelo
