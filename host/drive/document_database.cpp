// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/drive/document_database.h"

#include <sqlite3.h>
#include <stdio.h>

#include <cerrno>

#include "host/drive/small_file.h"

namespace vaelo {

namespace {

constexpr int busyMilliseconds = 5000;

constexpr const char* schema =
    "CREATE TABLE IF NOT EXISTS documents(id INTEGER PRIMARY KEY, device INTEGER NOT NULL, inode INTEGER NOT NULL,"
    " born INTEGER NOT NULL, path BLOB NOT NULL, carried INTEGER NOT NULL);"
    "CREATE UNIQUE INDEX IF NOT EXISTS documents_item ON documents(inode, device, born);";

bool isDamage(int status) {
  const int kind = status & 0xff;
  return kind == SQLITE_CORRUPT || kind == SQLITE_NOTADB;
}

}  // namespace

class DocumentDatabase::Statement {
 public:
  Statement(sqlite3* connection, const std::string& text)
      : status_(sqlite3_prepare_v2(connection, text.c_str(), -1, &statement_, nullptr)) {}
  ~Statement() { sqlite3_finalize(statement_); }
  Statement(const Statement&) = delete;
  Statement& operator=(const Statement&) = delete;

  void bind(std::int64_t value) { sqlite3_bind_int64(statement_, ++bound_, value); }
  // Bytes, since a path need not be text.
  void bind(const std::string& value) {
    sqlite3_bind_blob(statement_, ++bound_, value.data(), static_cast<int>(value.size()), SQLITE_TRANSIENT);
  }
  int step() { return status_ == SQLITE_OK ? sqlite3_step(statement_) : status_; }
  std::int64_t integer(int column) { return sqlite3_column_int64(statement_, column); }
  std::string bytes(int column) {
    const void* data = sqlite3_column_blob(statement_, column);
    return data ? std::string(static_cast<const char*>(data),
                              static_cast<std::size_t>(sqlite3_column_bytes(statement_, column)))
                : std::string();
  }

 private:
  sqlite3_stmt* statement_ = nullptr;
  int status_;
  int bound_ = 0;
};

DocumentDatabase::DocumentDatabase(std::string file, LogSink& log, std::function<std::vector<DocumentRow>()> remembered,
                                   std::function<void()> rebuilt)
    : file_(std::move(file)), log_(log), remembered_(std::move(remembered)), rebuilt_(std::move(rebuilt)) {}

DocumentDatabase::~DocumentDatabase() { close(); }

void DocumentDatabase::close() {
  sqlite3_close(connection_);
  connection_ = nullptr;
}

std::optional<Error> DocumentDatabase::open() {
  const std::lock_guard lock(mutex_);
  return openLocked();
}

bool DocumentDatabase::wasRebuilt() const {
  const std::lock_guard lock(mutex_);
  return wasRebuilt_;
}

Error DocumentDatabase::errorFor(int status) const {
  const int kind = status & 0xff;
  const std::string reason = connection_ ? sqlite3_errmsg(connection_) : sqlite3_errstr(status);
  if (kind == SQLITE_FULL) return fileError(FileErrorCode::WriteOutOfSpace, file_, reason);
  if (kind == SQLITE_READONLY) return fileError(FileErrorCode::WriteVolumeReadOnly, file_, reason);
  const int number = connection_ ? sqlite3_system_errno(connection_) : 0;
  const bool fromSystem = kind == SQLITE_CANTOPEN || kind == SQLITE_IOERR;
  if (fromSystem && number != 0) return errorFromErrno(number, file_, FileAccess::Write);
  if (kind == SQLITE_PERM) return fileError(FileErrorCode::WriteNoPermission, file_, reason);
  return fileError(FileErrorCode::WriteUnknown, file_, reason);
}

int DocumentDatabase::tryOpen() {
  constexpr int flags = SQLITE_OPEN_READWRITE | SQLITE_OPEN_CREATE | SQLITE_OPEN_NOMUTEX;  // mutex_ does it
  if (const int status = sqlite3_open_v2(file_.c_str(), &connection_, flags, nullptr)) return status;
  sqlite3_extended_result_codes(connection_, 1);
  sqlite3_busy_timeout(connection_, busyMilliseconds);
  int status = sqlite3_exec(connection_, "PRAGMA journal_mode=WAL; PRAGMA synchronous=NORMAL;", nullptr, nullptr, nullptr);
  if (status != SQLITE_OK) return status;
  {
    Statement check(connection_, "PRAGMA quick_check(1)");
    status = check.step();
    if (status != SQLITE_ROW) return status;
    if (check.bytes(0) != "ok") return SQLITE_CORRUPT;
  }
  status = sqlite3_exec(connection_, schema, nullptr, nullptr, nullptr);
  if (status != SQLITE_OK) return status == SQLITE_ERROR ? SQLITE_CORRUPT : status;
  // A sound file whose table is another's is as useless to us as a damaged one.
  Statement probe(connection_, "SELECT id, device, inode, born, path, carried FROM documents LIMIT 0");
  status = probe.step();
  return status == SQLITE_DONE ? SQLITE_OK : status == SQLITE_ERROR ? SQLITE_CORRUPT : status;
}

std::optional<Error> DocumentDatabase::openLocked() {
  if (connection_) return std::nullopt;
  const int status = tryOpen();
  if (status == SQLITE_OK) return std::nullopt;
  if (isDamage(status)) return rebuild();
  Error error = errorFor(status);
  close();
  log_.write(LogType::Error, "drive: can't open the document index: " + error.description());
  return error;
}

int DocumentDatabase::moveAside() {
  std::string aside;
  int status = EEXIST;
  for (int number = 1; status == EEXIST; ++number) {
    aside = file_ + ".damaged-" + std::to_string(number);
    status = renameWithoutReplacing(file_, aside);
  }
  if (status != 0) return status;
  // The log belongs to the database and would otherwise be played into the new one.
  ::rename((file_ + "-wal").c_str(), (aside + "-wal").c_str());
  ::remove((file_ + "-shm").c_str());
  log_.write(LogType::Error,
             "drive: the document index is damaged; moved aside to " + aside + " and rebuilt from the mirror");
  return 0;
}

std::optional<Error> DocumentDatabase::rebuild() {
  close();
  if (const int status = moveAside()) return errorFromErrno(status, file_, FileAccess::Write);
  if (const int status = tryOpen()) {
    Error error = errorFor(status);
    close();
    return error;
  }
  wasRebuilt_ = true;
  sqlite3_exec(connection_, "BEGIN", nullptr, nullptr, nullptr);
  int status = SQLITE_OK;
  for (const DocumentRow& row : remembered_()) {
    status = write("INSERT OR IGNORE", row);
    if (status != SQLITE_DONE) break;
  }
  // What does not fit now is found again when it is asked for: the items carry it.
  sqlite3_exec(connection_, "COMMIT", nullptr, nullptr, nullptr);
  if (rebuilt_) rebuilt_();
  return std::nullopt;
}

std::optional<Error> DocumentDatabase::run(const std::function<int()>& work) {
  const std::lock_guard lock(mutex_);
  if (auto error = openLocked()) return error;
  int status = work();
  if (isDamage(status)) {
    if (auto error = rebuild()) return error;
    status = work();
  }
  if (status == SQLITE_OK || status == SQLITE_DONE || status == SQLITE_ROW) return std::nullopt;
  return errorFor(status);
}

int DocumentDatabase::read(const char* where, const std::function<void(Statement&)>& bind, std::vector<DocumentRow>& rows) {
  rows.clear();
  Statement statement(connection_,
                      std::string("SELECT id, device, inode, born, path, carried FROM documents WHERE ") + where);
  bind(statement);
  int status = statement.step();
  for (; status == SQLITE_ROW; status = statement.step()) {
    DocumentRow row;
    row.id = statement.integer(0);
    row.device = static_cast<std::uint64_t>(statement.integer(1));
    row.inode = static_cast<std::uint64_t>(statement.integer(2));
    row.born = statement.integer(3);
    row.path = statement.bytes(4);
    row.carried = statement.integer(5) != 0;
    rows.push_back(std::move(row));
  }
  return status;
}

int DocumentDatabase::write(const char* verb, const DocumentRow& row) {
  Statement statement(connection_, std::string(verb) +
                                       " INTO documents(id, device, inode, born, path, carried)"
                                       " VALUES(?, ?, ?, ?, ?, ?)");
  statement.bind(row.id);
  statement.bind(static_cast<std::int64_t>(row.device));
  statement.bind(static_cast<std::int64_t>(row.inode));
  statement.bind(row.born);
  statement.bind(row.path);
  statement.bind(static_cast<std::int64_t>(row.carried));
  return statement.step();
}

Result<DocumentRow> DocumentDatabase::withID(std::int64_t id) {
  std::vector<DocumentRow> rows;
  if (auto error = run([&] {
        return read(
            "id = ?", [id](Statement& at) { at.bind(id); }, rows);
      }))
    return *error;
  return rows.empty() ? Result<DocumentRow>() : Result<DocumentRow>(rows.front());
}

Result<std::vector<DocumentRow>> DocumentDatabase::withInode(std::uint64_t device, std::uint64_t inode) {
  std::vector<DocumentRow> rows;
  const auto bind = [&](Statement& at) {
    at.bind(static_cast<std::int64_t>(inode));
    at.bind(static_cast<std::int64_t>(device));
  };
  if (auto error = run([&] { return read("inode = ? AND device = ?", bind, rows); })) return *error;
  return rows;
}

Result<bool> DocumentDatabase::add(const DocumentRow& row) {
  bool added = false;
  const auto work = [&] {
    const int status = write("INSERT OR IGNORE", row);
    added = status == SQLITE_DONE && sqlite3_changes(connection_) == 1;
    return status;
  };
  if (auto error = run(work)) return *error;
  return added;
}

std::optional<Error> DocumentDatabase::put(const DocumentRow& row) {
  return run([&] { return write("INSERT OR REPLACE", row); });
}

std::optional<Error> DocumentDatabase::remove(std::int64_t id) {
  return run([&] {
    Statement statement(connection_, "DELETE FROM documents WHERE id = ?");
    statement.bind(id);
    return statement.step();
  });
}

}  // namespace vaelo
