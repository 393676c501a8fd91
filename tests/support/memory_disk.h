// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <map>
#include <memory>
#include <optional>
#include <string>

#include "tests/support/memory_clock.h"
#include "tests/support/memory_item.h"

namespace vaelo {

/// A file system in memory. Paths mean what they mean on a real one: links are followed, "." and ".." lead where they lead.
/// It is the one truth behind the services in memory.
class MemoryDisk {
 public:
  static constexpr std::size_t NameLimit = 255;  // bytes

  explicit MemoryDisk(std::shared_ptr<MemoryClock> clock) : clock_(std::move(clock)) {}

  /// Adds an item, or says anew what it is; folders above are added too.
  MemoryItem& add(const std::string& path, FileType type = FileType::Regular, std::uint64_t size = 0);
  MemoryItem& addFolder(const std::string& path) { return add(path, FileType::Directory); }
  MemoryItem& addLink(const std::string& path, const std::string& target);
  /// An item that is not downloaded.
  MemoryItem& addPromise(const std::string& path, std::uint64_t size = 0);

  Date now() const { return clock_->date(); }

  /// By logical path.
  std::map<std::string, MemoryItem> items;

  /// Every link followed, "." and ".." gone; what does not exist keeps its last components, a link in a circle stays.
  std::string realPath(const std::string& path) const;
  /// The key in `items` that `path` leads to, the last component not followed; also of something that is not there.
  std::string place(const std::string& path) const;
  /// The item itself, downloaded or not, by its logical path.
  MemoryItem* logicalItem(const std::string& path);
  /// What stands on the disk at the path: an item that is not downloaded is at its physical path alone.
  MemoryItem* physicalItem(const std::string& path);
  bool isLocked(const std::string& path) const;
  bool hasFolder(const std::string& path);

  static bool isPromiseName(const std::string& name);
  /// Names that would be too long are made from a hash; only what is on the disk tells what they stand for.
  static std::string promisePath(const std::string& logicalPath);
  /// The path itself when it is no promise's.
  std::string logicalPath(const std::string& path) const;

  /// The item's identifier, made when it has none.
  std::int64_t documentIDOf(MemoryItem& item);
  std::optional<std::string> pathOfDocument(std::int64_t documentID) const;
  void remove(const std::string& place);
  void move(const std::string& from, const std::string& to);

 private:
  std::optional<std::string> follow(const std::string& from, const std::string& name) const;

  std::shared_ptr<MemoryClock> clock_;
  std::int64_t lastDocumentID_ = 1000;
};

}  // namespace vaelo
