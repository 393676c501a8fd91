// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/gtk/list/folder_snapshot.h"

#include <unordered_set>

#include "host/drive/alias_file.h"
#include "host/drive/bookmark_file.h"
#include "host/drive/packages.h"
#include "host/gtk/list/name_order.h"

namespace vaelo {

EntryKind kindOfName(std::string_view name, bool directory) {
  if (directory) return isPackageName(name) ? EntryKind::Package : EntryKind::Folder;
  if (isBookmarkName(name)) return EntryKind::Bookmark;
  return isAliasName(name) ? EntryKind::Alias : EntryKind::Document;
}

void FolderSnapshot::Draft::add(std::string_view name, EntryKind kind) {
  entries_.push_back({static_cast<std::uint32_t>(names_.size()), static_cast<std::uint16_t>(name.size()), kind});
  names_.append(name);
}

std::shared_ptr<const FolderSnapshot> FolderSnapshot::sorted(Draft draft) {
  std::vector<std::uint32_t> folders;
  std::vector<std::uint32_t> documents;
  std::unordered_set<std::string_view> promises;
  for (std::uint32_t i = 0; i < draft.size(); ++i) {
    (isListedAsFolder(draft.kind(i)) ? folders : documents).push_back(i);
    if (isPromised(draft.kind(i))) promises.insert(draft.name(i));
  }
  std::unordered_set<std::string_view> downloaded;
  for (std::uint32_t i = 0; i < draft.size() && !promises.empty(); ++i) {
    if (!isPromised(draft.kind(i)) && promises.contains(draft.name(i))) downloaded.insert(draft.name(i));
  }

  auto snapshot = std::make_shared<FolderSnapshot>();
  snapshot->draft_.entries_.reserve(draft.size());
  snapshot->draft_.names_.reserve(draft.names_.size());
  std::vector<std::string_view> names;
  for (const std::vector<std::uint32_t>* group : {&folders, &documents}) {
    names.clear();
    for (const std::uint32_t i : *group) names.push_back(draft.name(i));
    for (const std::uint32_t place : sortedOrder(names)) {
      const std::uint32_t i = (*group)[place];
      if (isPromised(draft.kind(i)) && downloaded.contains(draft.name(i))) continue;
      snapshot->draft_.add(draft.name(i), draft.kind(i));
    }
  }
  return snapshot;
}

int FolderSnapshot::compare(std::size_t i, std::string_view name, EntryKind kind) const {
  const bool folder = isListedAsFolder(this->kind(i));
  if (folder != isListedAsFolder(kind)) return folder ? -1 : 1;
  return compareNames(this->name(i), name);
}

std::size_t FolderSnapshot::lowerBound(std::string_view name, EntryKind kind) const {
  std::size_t low = 0;
  std::size_t high = size();
  while (low < high) {
    const std::size_t middle = low + (high - low) / 2;
    if (compare(middle, name, kind) < 0) {
      low = middle + 1;
    } else {
      high = middle;
    }
  }
  return low;
}

std::optional<std::size_t> FolderSnapshot::indexOf(std::string_view name) const {
  for (const EntryKind kind : {EntryKind::Folder, EntryKind::Document}) {
    const std::size_t i = lowerBound(name, kind);
    if (i < size() && this->name(i) == name) return i;
  }
  return std::nullopt;
}

std::shared_ptr<const FolderSnapshot> FolderSnapshot::with(const std::vector<EntryChange>& changes) const {
  std::unordered_set<std::string_view> touched;
  Draft present;
  for (const EntryChange& change : changes) {
    if (touched.insert(change.name).second && change.kind) present.add(change.name, *change.kind);
  }
  const auto arrivals = sorted(std::move(present));
  auto next = std::make_shared<FolderSnapshot>();
  next->draft_.entries_.reserve(size() + arrivals->size());
  next->draft_.names_.reserve(draft_.names_.size());
  std::size_t from = 0;
  const auto keepUntil = [&](std::size_t end) {
    for (; from < end; ++from) {
      if (!touched.contains(name(from))) next->draft_.add(name(from), kind(from));
    }
  };
  for (std::size_t i = 0; i < arrivals->size(); ++i) {
    keepUntil(lowerBound(arrivals->name(i), arrivals->kind(i)));
    next->draft_.add(arrivals->name(i), arrivals->kind(i));
  }
  keepUntil(size());
  return next;
}

std::vector<Splice> FolderSnapshot::splicesTo(const FolderSnapshot& next) const {
  std::vector<Splice> splices;
  std::size_t i = 0;
  std::size_t j = 0;
  while (i < size() || j < next.size()) {
    Splice splice{j, 0, 0};
    while (i < size() || j < next.size()) {
      int order = i == size() ? 1 : j == next.size() ? -1 : 0;
      if (!order) {
        const bool sameGroup = isListedAsFolder(kind(i)) == isListedAsFolder(next.kind(j));
        if (sameGroup && name(i) == next.name(j)) break;
        order = compare(i, next.name(j), next.kind(j));
      }
      if (order < 0) {
        ++i;
        ++splice.removed;
      } else {
        ++j;
        ++splice.added;
      }
    }
    if (splice.removed || splice.added) splices.push_back(splice);
    ++i;
    ++j;
  }
  return splices;
}

}  // namespace vaelo
