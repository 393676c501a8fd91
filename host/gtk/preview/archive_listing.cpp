// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/gtk/preview/archive_listing.h"

#include <glib.h>

#include <algorithm>
#include <charconv>
#include <limits>

#include "host/gtk/list/name_order.h"

namespace vaelo {

namespace {

constexpr std::size_t MostListedEntries = 100'000;
constexpr std::int64_t LatestDate = 9'000'000'000;  // in the year 2255; what is said to be later isn't
constexpr int MostLevels = 40;                      // what is deeper stands in one row with its path

std::string_view nextField(std::string_view& line) {
  const std::size_t end = std::min(line.find('\t'), line.size());
  const std::string_view field = line.substr(0, end);
  line.remove_prefix(std::min(end + 1, line.size()));
  return field;
}

template <typename Number>
std::optional<Number> numberIn(std::string_view field) {
  Number number = 0;
  const auto [end, problem] = std::from_chars(field.data(), field.data() + field.size(), number);
  if (problem != std::errc() || end != field.data() + field.size()) return std::nullopt;
  return number;
}

std::string_view withoutSlashes(std::string_view path) {
  while (!path.empty() && path.front() == '/') path.remove_prefix(1);
  while (!path.empty() && path.back() == '/') path.remove_suffix(1);
  return path;
}

// Of "./folder//name" the folder, and "name" is left.
std::string_view nextComponent(std::string_view& path) {
  while (true) {
    path = withoutSlashes(path);
    const std::size_t end = std::min(path.find('/'), path.size());
    const std::string_view component = path.substr(0, end);
    path = withoutSlashes(path.substr(end));
    if (component != ".") return component;
  }
}

}  // namespace

ArchiveListing::ArchiveListing(std::string unnamed) : unnamed_(std::move(unnamed)), entries_(1) {
  entries_[0].isFolder = true;
}

void ArchiveListing::add(std::string_view lines) {
  while (!lines.empty()) {
    const std::size_t end = std::min(lines.find('\n'), lines.size());
    addLine(lines.substr(0, end));
    lines.remove_prefix(std::min(end + 1, lines.size()));
  }
}

void ArchiveListing::addLine(std::string_view line) {
  Entry entry;
  std::string_view type = nextField(line);
  if (type.ends_with('*')) {
    entry.isLocked = hasLocked_ = true;
    type.remove_suffix(1);
  }
  entry.isFolder = type == "folder";
  if (!entry.isFolder && type != "file" && type != "link" && type != "other") return;
  if (type == "file") {
    entry.size = numberIn<std::uint64_t>(nextField(line));
  } else {
    nextField(line);
  }
  const std::optional<std::int64_t> modified = numberIn<std::int64_t>(nextField(line));
  if (modified && *modified > 0 && *modified < LatestDate) entry.modified = modified;
  if (!g_utf8_validate(line.data(), static_cast<gssize>(line.size()), nullptr)) return;
  addEntry(std::move(entry), line);
}

void ArchiveListing::addEntry(Entry entry, std::string_view path) {
  std::uint32_t inside = 0;
  std::string_view name = nextComponent(path);
  for (int level = 0; !path.empty(); ++level) {
    if (level == MostLevels) {
      entry.name = std::string(name) + "/" + std::string(path);
      append(inside, std::move(entry));
      return;
    }
    inside = folder(inside, name);
    name = nextComponent(path);
    if (name.empty()) break;
  }
  if (entry.isFolder) {
    if (name.empty()) return;  // the archive's own top
    Entry& made = entries_[folder(inside, name)];
    made.modified = entry.modified;
    return;
  }
  entry.name = name.empty() ? unnamed_ : std::string(name);
  append(inside, std::move(entry));
}

std::uint32_t ArchiveListing::folder(std::uint32_t inside, std::string_view name) {
  const std::string key = std::to_string(inside) + "/" + std::string(name);
  const auto found = folders_.find(key);
  if (found != folders_.end()) return found->second;
  Entry made;
  made.name = name;
  made.isFolder = true;
  const std::uint32_t index = append(inside, std::move(made));
  if (index != inside) folders_.emplace(key, index);
  return index;
}

// The containing folder itself when there is no more room.
std::uint32_t ArchiveListing::append(std::uint32_t inside, Entry entry) {
  if (entries_.size() >= MostListedEntries) {
    isFull_ = true;
    return inside;
  }
  const auto index = static_cast<std::uint32_t>(entries_.size());
  if (!entry.isFolder) {
    ++files_;
    const std::uint64_t room = std::numeric_limits<std::uint64_t>::max() - bytes_;
    bytes_ += std::min(entry.size.value_or(0), room);
  }
  entries_[inside].inside.push_back(index);
  entries_.push_back(std::move(entry));
  return index;
}

void ArchiveListing::sort() {
  for (Entry& folder : entries_) {
    std::vector<std::string_view> names;
    names.reserve(folder.inside.size());
    for (const std::uint32_t index : folder.inside) names.push_back(entries_[index].name);
    std::vector<std::uint32_t> sorted;
    sorted.reserve(names.size());
    for (const std::uint32_t place : sortedOrder(names)) sorted.push_back(folder.inside[place]);
    std::stable_partition(sorted.begin(), sorted.end(), [&](std::uint32_t index) { return entries_[index].isFolder; });
    folder.inside = std::move(sorted);
  }
}

}  // namespace vaelo
