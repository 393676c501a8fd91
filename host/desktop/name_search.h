// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <atomic>
#include <chrono>
#include <string>
#include <vector>

namespace vaelo {

/// A folder to search below, and what it is called. A root with a name can be found itself.
struct SearchRoot {
  std::string folder;
  std::string name;
};

/// What a search found. Names and kinds stem from folder records alone.
struct SearchHit {
  std::string path;
  bool operator==(const SearchHit&) const = default;
};

/// Looks for items whose names hold all of some terms, without regard to case and accents. Links are not followed, hidden
/// items are not found, and no item is opened. Blocks, so belongs on a worker; any thread.
class NameSearch {
 public:
  /// Empty, or with a term that is longer than a name can be, it finds nothing.
  explicit NameSearch(const std::vector<std::string>& terms);

  /// At most `most` hits, the best first: names that are the terms, that begin with them, in which a word does, all others;
  /// among equals those nearer to their root. Stops when `budget` is used up or `stopped`, with what it has.
  std::vector<SearchHit> run(const std::vector<SearchRoot>& roots, std::size_t most, std::chrono::milliseconds budget,
                             const std::atomic<bool>& stopped) const;

 private:
  /// 0 for the best; below 0 for names that don't match.
  int rankOf(const std::string& name) const;

  std::vector<std::string> terms_;  // folded
  std::string whole_;
};

}  // namespace vaelo
