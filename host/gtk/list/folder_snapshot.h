// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <cstdint>
#include <memory>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

namespace vaelo {

/// What an entry is, as far as its name and the folder's own record tell; nothing was read of the entry itself.
enum class EntryKind : std::uint8_t {
  Folder,
  FolderLink,  ///< a symbolic link to a folder
  Package,
  Document,
  Symlink,  ///< a symbolic link to a document, or to nothing
  Promise,
  PromisedPackage,
  Alias,
  Bookmark,
};

/// True for what stands among the folders and opens as one.
constexpr bool isListedAsFolder(EntryKind kind) { return kind == EntryKind::Folder || kind == EntryKind::FolderLink; }
/// True for items that are not downloaded.
constexpr bool isPromised(EntryKind kind) { return kind == EntryKind::Promise || kind == EntryKind::PromisedPackage; }
/// The kind of an entry that is there (no promise) and hasn't to do with links, by its name.
EntryKind kindOfName(std::string_view name, bool directory);

/// A run of entries to take out and to put in at `position`, counted after all earlier splices.
struct Splice {
  std::size_t position;
  std::size_t removed;
  std::size_t added;
  bool operator==(const Splice&) const = default;
};

/// What a name stands for now; nothing when there is no such entry any longer.
struct EntryChange {
  std::string name;
  std::optional<EntryKind> kind;
};

/// The entries of a folder at one moment, in the order in which they are listed: folders, then documents, each as people
/// count. Immutable, so safe from any thread. Names are bytes and may not be UTF-8. Takes 8 bytes an entry and the names.
class FolderSnapshot {
 public:
  /// Entries as they were found.
  class Draft {
   public:
    /// Names are at most 65,535 bytes (a file system gives 255).
    void add(std::string_view name, EntryKind kind);
    std::size_t size() const { return entries_.size(); }
    std::string_view name(std::size_t i) const { return {names_.data() + entries_[i].offset, entries_[i].length}; }
    EntryKind kind(std::size_t i) const { return entries_[i].kind; }

   private:
    friend class FolderSnapshot;
    struct Entry {
      std::uint32_t offset;
      std::uint16_t length;
      EntryKind kind;
    };
    std::string names_;
    std::vector<Entry> entries_;
  };

  FolderSnapshot() = default;
  /// O(n log n). A name that is there twice is listed once: an entry that is on the disk hides the promise of its name.
  static std::shared_ptr<const FolderSnapshot> sorted(Draft draft);
  /// This with the changes, O(n + k log n) for k changes.
  std::shared_ptr<const FolderSnapshot> with(const std::vector<EntryChange>& changes) const;
  /// What turns this into `next`, in ascending order. An entry whose kind changed, but not its place, is no difference.
  std::vector<Splice> splicesTo(const FolderSnapshot& next) const;

  std::size_t size() const { return draft_.size(); }
  std::string_view name(std::size_t i) const { return draft_.name(i); }
  EntryKind kind(std::size_t i) const { return draft_.kind(i); }
  /// O(log n).
  std::optional<std::size_t> indexOf(std::string_view name) const;

 private:
  int compare(std::size_t i, std::string_view name, EntryKind kind) const;
  std::size_t lowerBound(std::string_view name, EntryKind kind) const;

  Draft draft_;
};

}  // namespace vaelo
