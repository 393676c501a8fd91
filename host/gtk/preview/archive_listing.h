// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <cstdint>
#include <optional>
#include <string>
#include <string_view>
#include <unordered_map>
#include <vector>

namespace vaelo {

/// What is in an archive, as folders within folders; those that the archive doesn't name itself are made up.
class ArchiveListing {
 public:
  struct Entry {
    std::string name;  ///< for people; UTF-8
    bool isFolder = false;
    bool isLocked = false;
    std::optional<std::uint64_t> size;     ///< in bytes, unpacked
    std::optional<std::int64_t> modified;  ///< in seconds since 1970
    std::vector<std::uint32_t> inside;     ///< indices of entries; in the order of a list once sort() was called
  };

  /// `unnamed` stands for an entry whose name the archive doesn't tell.
  explicit ArchiveListing(std::string unnamed);
  /// Lines of ArchiveDecoder; what isn't one is left out.
  void add(std::string_view lines);
  /// Folders first, then as people count.
  void sort();

  /// The first entry is the archive itself.
  const Entry& entry(std::uint32_t index) const { return entries_[index]; }
  std::size_t files() const { return files_; }
  std::size_t folders() const { return entries_.size() - 1 - files_; }
  /// Bytes of all files whose size is known.
  std::uint64_t bytes() const { return bytes_; }
  bool hasLocked() const { return hasLocked_; }
  /// There was more than it keeps.
  bool isFull() const { return isFull_; }

 private:
  void addLine(std::string_view line);
  void addEntry(Entry entry, std::string_view path);
  std::uint32_t folder(std::uint32_t inside, std::string_view name);
  std::uint32_t append(std::uint32_t inside, Entry entry);

  std::string unnamed_;
  std::vector<Entry> entries_;
  std::unordered_map<std::string, std::uint32_t> folders_;  // by the containing folder's index, a slash and the name
  std::size_t files_ = 0;
  std::uint64_t bytes_ = 0;
  bool hasLocked_ = false;
  bool isFull_ = false;
};

}  // namespace vaelo
