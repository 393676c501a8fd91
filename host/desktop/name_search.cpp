// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/desktop/name_search.h"

#include <glib.h>

#include <algorithm>
#include <tuple>

#include "host/gtk/list/folder_reader.h"
#include "host/support/glib_ptr.h"

namespace vaelo {

namespace {

constexpr std::size_t LongestTerm = 255;  // bytes of a name
constexpr std::size_t MostTerms = 16;

/// Case and accents removed.
std::string folded(const std::string& text) {
  const std::string valid = takeString(g_utf8_make_valid(text.c_str(), static_cast<gssize>(text.size())));
  const std::string apart = takeString(g_utf8_normalize(valid.c_str(), -1, G_NORMALIZE_ALL));
  std::string plain;
  for (const char *at = apart.c_str(), *next; *at; at = next) {
    next = g_utf8_next_char(at);
    if (!g_unichar_ismark(g_utf8_get_char(at))) plain.append(at, next);
  }
  return takeString(g_utf8_casefold(plain.c_str(), -1));
}

bool beginsWord(const std::string& name, std::size_t at) {
  return at == 0 || !g_unichar_isalnum(g_utf8_get_char(g_utf8_prev_char(name.c_str() + at)));
}

struct Found {
  int rank;
  std::size_t depth;
  std::string name;
  std::string path;
  bool operator<(const Found& other) const {
    return std::tie(rank, depth, name, path) < std::tie(other.rank, other.depth, other.name, other.path);
  }
};

struct Folder {
  std::string path;
  std::size_t depth;
};

}  // namespace

NameSearch::NameSearch(const std::vector<std::string>& terms) {
  if (terms.size() > MostTerms) return;
  for (const std::string& term : terms) {
    const std::string plain = folded(term);
    if (plain.size() > LongestTerm) {
      terms_.clear();
      return;
    }
    if (plain.empty()) continue;
    terms_.push_back(plain);
    whole_ += (whole_.empty() ? "" : " ") + plain;
  }
}

int NameSearch::rankOf(const std::string& name) const {
  const std::string plain = folded(name);
  bool words = true;
  for (const std::string& term : terms_) {
    const std::size_t at = plain.find(term);
    if (at == std::string::npos) return -1;
    words = words && beginsWord(plain, at);
  }
  if (plain == whole_) return 0;
  if (plain.starts_with(whole_)) return 1;
  return words ? 2 : 3;
}

std::vector<SearchHit> NameSearch::run(const std::vector<SearchRoot>& roots, std::size_t most,
                                       std::chrono::milliseconds budget, const std::atomic<bool>& stopped) const {
  if (terms_.empty()) return {};
  const auto end = std::chrono::steady_clock::now() + budget;
  std::vector<Found> found;
  std::vector<Folder> folders;
  for (const SearchRoot& root : roots) {
    const int rank = root.name.empty() ? -1 : rankOf(root.name);
    if (rank >= 0) found.push_back({rank, 0, root.name, root.folder});
    folders.push_back({root.folder, 1});
  }
  // Breadth first: when the time is up, what lies near has been looked at.
  for (std::size_t i = 0; i < folders.size() && !stopped && std::chrono::steady_clock::now() < end; ++i) {
    const Folder folder = folders[i];
    const FolderReading reading = readFolder(folder.path);
    if (!reading.snapshot) continue;
    for (std::size_t entry = 0; entry < reading.snapshot->size(); ++entry) {
      const std::string name(reading.snapshot->name(entry));
      const std::string path = folder.path + "/" + name;
      if (const int rank = rankOf(name); rank >= 0) found.push_back({rank, folder.depth, name, path});
      if (reading.snapshot->kind(entry) == EntryKind::Folder) folders.push_back({path, folder.depth + 1});
    }
  }
  const std::size_t count = std::min(most, found.size());
  std::partial_sort(found.begin(), found.begin() + static_cast<std::ptrdiff_t>(count), found.end());
  std::vector<SearchHit> hits;
  for (std::size_t i = 0; i < count; ++i) hits.push_back({std::move(found[i].path)});
  return hits;
}

}  // namespace vaelo
