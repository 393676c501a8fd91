// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/gtk/list/folder_entries.h"

namespace vaelo {

std::optional<std::size_t> FolderEntries::indexOf(std::string_view path) const {
  if (places_.empty()) {
    places_.reserve(entries_.size());
    for (std::size_t i = 0; i < entries_.size(); ++i) places_.emplace(entries_[i].path, i);
  }
  const auto found = places_.find(path);
  return found == places_.end() ? std::nullopt : std::optional(found->second);
}

}  // namespace vaelo
