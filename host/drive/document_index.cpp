// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/drive/document_index.h"

#include <sys/random.h>

#include <algorithm>

#include "host/drive/mirror_walk.h"
#include "host/drive/promise_file.h"
#include "host/drive/small_file.h"

namespace vaelo {

namespace {

// Identifiers are random, so that one that was lost with its database is not given to another document.
std::int64_t randomID() {
  std::uint64_t bits = 0;
  while (::getrandom(&bits, sizeof bits, 0) != static_cast<ssize_t>(sizeof bits)) {
  }
  // Within 53 bits: what is exact as a floating-point number survives every format.
  return static_cast<std::int64_t>(bits >> 11) | 1;
}

DocumentRow rowFor(std::int64_t id, const ItemIdentity& item, const std::string& path, bool carried) {
  return {id, item.device, item.inode, item.born, path, carried};
}

ItemIdentity itemOf(const DocumentRow& row) { return {row.device, row.inode, row.born, 0}; }

IndexedDocument document(const DocumentRow& row) { return {row.id, row.path, row.device, row.inode}; }

// The folder's links are followed, the item's own is not: a link is an item too.
std::string canonical(const std::string& path) {
  const std::size_t slash = path.rfind('/');
  const std::string folder = realLocation(slash == 0 ? "/" : path.substr(0, slash));
  return (folder == "/" ? "" : folder) + path.substr(slash);
}

Error notFound(const std::string& path) { return fileError(FileErrorCode::NoSuchFile, path, "there is no such document"); }

std::vector<DocumentRow> carriedRows(const std::string& mirror) {
  std::vector<DocumentRow> rows;
  walkTree(mirror, [&rows](const std::string& path, const struct stat&) {
    const std::optional<ItemIdentity> item = identityOf(path);
    if (item && item->carriedID != 0) rows.push_back(rowFor(item->carriedID, *item, path, true));
    return true;
  });
  // Of an item and its copies with the same identifier the eldest is the original.
  std::stable_sort(rows.begin(), rows.end(), [](const DocumentRow& a, const DocumentRow& b) { return a.born < b.born; });
  return rows;
}

}  // namespace

DocumentIndex::DocumentIndex(const DriveLayout& layout, LogSink& log, std::function<void()> rebuilt,
                             std::chrono::milliseconds walksAgainAfter)
    : layout_(layout),
      log_(log),
      database_(
          layout.indexFile(), log, [&layout] { return carriedRows(layout.mirrorRoot()); }, std::move(rebuilt)),
      walksAgainAfter_(walksAgainAfter) {}

Result<std::int64_t> DocumentIndex::documentIDFor(const std::string& path, bool create) {
  if (path.empty() || path.front() != '/' || path.find('\0') != std::string::npos) return notFound(path);
  const std::optional<std::string> physical = physicalPathOf(canonical(path));
  if (!physical) return notFound(path);
  const std::optional<ItemIdentity> item = identityOf(*physical);
  if (!item) return notFound(path);
  if (item->carriedID != 0) return carriedIDOf(*physical, *item, create);

  const Result<std::vector<DocumentRow>> rows = database_.withInode(item->device, item->inode);
  if (!rows) return *rows.error;
  for (DocumentRow row : *rows.value) {
    if (!itemOf(row).isSameFile(*item)) continue;
    // The attribute may have been lost on the way through another program.
    const bool carried = row.carried && carryID(*physical, row.id, false) == Carrying::Done;
    if (row.path != *physical || row.carried != carried) {
      row.path = *physical;
      row.carried = carried;
      if (auto error = database_.put(row)) return *error;
    }
    return row.id;
  }
  return create ? makeID(*physical, false) : Result<std::int64_t>(std::int64_t{0});
}

Result<std::int64_t> DocumentIndex::carriedIDOf(const std::string& path, const ItemIdentity& item, bool create) {
  const std::int64_t id = item.carriedID;
  const Result<DocumentRow> row = database_.withID(id);
  if (row.error) return *row.error;
  const bool sameFile = row && itemOf(*row.value).isSameFile(item);
  if (sameFile && row.value->path == path) return id;
  if (row && !sameFile) {
    const std::optional<IndexedDocument> original = locate(*row.value);
    // Found elsewhere, and it is not this item: this one is a copy.
    if (original && original->path != path) return create ? makeID(path, true) : Result<std::int64_t>(std::int64_t{0});
    if (original) return id;
  }
  if (auto error = database_.put(rowFor(id, item, path, true))) return *error;
  return id;
}

Result<std::int64_t> DocumentIndex::makeID(const std::string& path, bool replacing) {
  constexpr int attempts = 16;
  for (int attempt = 0; attempt < attempts; ++attempt) {
    const std::optional<ItemIdentity> item = identityOf(path);
    if (!item) return notFound(path);
    DocumentRow row = rowFor(randomID(), *item, path, true);
    const Result<bool> added = database_.add(row);
    if (!added) return *added.error;
    if (!*added.value) {
      // Another thread or process gave this item one in the meantime, or the number is taken.
      const Result<std::vector<DocumentRow>> rows = database_.withInode(item->device, item->inode);
      if (!rows) return *rows.error;
      for (const DocumentRow& other : *rows.value) {
        if (!itemOf(other).isSameFile(*item)) continue;
        if (replacing) carryID(path, other.id, true);
        return other.id;
      }
      continue;
    }
    switch (carryID(path, row.id, replacing)) {
      case Carrying::Done:
        // The promise was written anew, which made it another file.
        if (const auto now = identityOf(path); now && !now->isSameFile(*item)) {
          if (auto error = database_.put(rowFor(row.id, *now, path, true))) return *error;
        }
        return row.id;
      case Carrying::NotPossible:
        row.carried = false;
        if (auto error = database_.put(row)) return *error;
        return row.id;
      case Carrying::CarriesAnother:
        if (auto error = database_.remove(row.id)) return *error;
        if (const auto now = identityOf(path); now && now->carriedID != 0) return carriedIDOf(path, *now, true);
        replacing = true;  // what it carries is no identifier
        break;
    }
  }
  return fileError(FileErrorCode::WriteUnknown, path, "the document gets no identifier");
}

std::optional<IndexedDocument> DocumentIndex::locate(const DocumentRow& row) {
  const ItemIdentity wanted = itemOf(row);
  const auto isDocument = [&](const ItemIdentity& item) {
    return row.carried ? item.carriedID == row.id : item.carriedID == 0 && item.isSameFile(wanted);
  };
  std::optional<DocumentRow> found;
  const std::optional<ItemIdentity> there = identityOf(row.path);
  if (there && isDocument(*there)) {
    if (there->isSameFile(wanted)) return document(row);
    found = rowFor(row.id, *there, row.path, row.carried);
  }
  if (!found && wasSoughtInVain(row.id)) return std::nullopt;
  // At its place stands at best a copy: another program moved the document, or replaced it by a new file.
  walkTree(layout_.mirrorRoot(), [&](const std::string& path, const struct stat& status) {
    if (!row.carried && status.st_ino != row.inode) return true;
    const std::optional<ItemIdentity> item = identityOf(path);
    if (!item || !isDocument(*item)) return true;
    const bool exact = item->isSameFile(wanted);
    if (exact || !found) found = rowFor(row.id, *item, path, row.carried);
    return !exact;
  });
  if (!found) {
    noteSoughtInVain(row.id);
    return std::nullopt;
  }
  if (const auto error = database_.put(*found)) {
    log_.write(LogType::Error, "drive: can't note where a document is: " + error->description());
  }
  return document(*found);
}

bool DocumentIndex::wasSoughtInVain(std::int64_t id) {
  const std::lock_guard lock(mutex_);
  const auto now = std::chrono::steady_clock::now();
  std::erase_if(soughtInVain_, [&](const auto& sought) { return now - sought.second >= walksAgainAfter_; });
  return soughtInVain_.contains(id);
}

void DocumentIndex::noteSoughtInVain(std::int64_t id) {
  const std::lock_guard lock(mutex_);
  soughtInVain_[id] = std::chrono::steady_clock::now();
}

Result<IndexedDocument> DocumentIndex::resolve(std::int64_t id) {
  if (id <= 0) return notFound(std::to_string(id));
  Result<DocumentRow> row = database_.withID(id);
  if (row.error) return *row.error;
  if (!row) {
    row.value = DocumentRow();
    row.value->id = id;
  }
  if (auto found = locate(*row.value)) return *found;
  return notFound(std::to_string(id));
}

Result<IndexedDocument> DocumentIndex::documentWithInode(std::uint64_t device, std::uint64_t inode) {
  const Result<std::vector<DocumentRow>> rows = database_.withInode(device, inode);
  if (!rows) return *rows.error;
  for (const DocumentRow& row : *rows.value) {
    const std::optional<IndexedDocument> found = locate(row);
    if (found && found->device == device && found->inode == inode) return *found;
  }
  return notFound(std::to_string(inode));
}

}  // namespace vaelo
