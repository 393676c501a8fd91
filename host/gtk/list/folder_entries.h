// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <cstddef>
#include <optional>
#include <string>
#include <string_view>
#include <unordered_map>
#include <vector>

#include "host/gtk/list/folder_snapshot.h"

namespace vaelo {

inline constexpr const char* LibraryIcon = "applications-other";

/// An entry that a caller supplies instead of a folder.
struct FolderEntry {
  std::string displayName;  ///< UTF-8, shown as it is
  std::string path;         ///< absolute, bytes; names the entry in all calls
  EntryKind kind = EntryKind::Document;
  std::string icon{};   ///< the name of an icon; empty for that of the kind
  std::string place{};  ///< UTF-8, where it lies; empty where that is plain
};

/// Entries that a caller supplied, in their order. They don't change any more. Main thread.
class FolderEntries {
 public:
  explicit FolderEntries(std::vector<FolderEntry> entries) : entries_(std::move(entries)) {}
  FolderEntries(const FolderEntries&) = delete;
  FolderEntries& operator=(const FolderEntries&) = delete;

  std::size_t size() const { return entries_.size(); }
  const FolderEntry& operator[](std::size_t i) const { return entries_[i]; }
  /// The first time O(n), then O(1).
  std::optional<std::size_t> indexOf(std::string_view path) const;

 private:
  std::vector<FolderEntry> entries_;
  mutable std::unordered_map<std::string_view, std::size_t> places_;  // keys are the entries' own paths
};

}  // namespace vaelo
