// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/gtk/folder_search.h"

#include <algorithm>
#include <chrono>
#include <iterator>
#include <thread>
#include <utility>

#include "host/gtk/list/folder_reader.h"
#include "host/gtk/list/name_order.h"
#include "host/support/glib_ptr.h"

namespace vaelo {

namespace {

constexpr std::size_t MostResults = 5000;

/// Comparable form of a name: valid UTF-8, composed, folded.
std::string folded(const std::string& name) {
  const std::string valid = takeString(g_utf8_make_valid(name.c_str(), static_cast<gssize>(name.size())));
  const std::string normal = takeString(g_utf8_normalize(valid.c_str(), -1, G_NORMALIZE_ALL_COMPOSE));
  return takeString(g_utf8_casefold(normal.c_str(), -1));
}

/// A name among others that may be read the other way.
std::string isolated(const std::string& name) { return "\u2068" + name + "\u2069"; }

bool standsBefore(const FolderEntry& left, const FolderEntry& right) {
  const bool folder = isListedAsFolder(left.kind);
  if (folder != isListedAsFolder(right.kind)) return folder;
  const int order = compareNames(left.displayName, right.displayName);
  return order == 0 ? left.path < right.path : order < 0;
}

struct Batch {
  FolderSearch::Report report;
  std::shared_ptr<std::atomic<bool>> stopped;
  std::shared_ptr<FolderSearch::Found> found;
};

class Searching {
 public:
  Searching(std::string query, std::shared_ptr<std::atomic<bool>> stopped, std::shared_ptr<FolderSearch::Found> found)
      : query_(std::move(query)), stopped_(std::move(stopped)), found_(std::move(found)) {}

  void run(const std::vector<FolderSearch::Folder>& begin) {
    std::vector<Folder> folders;
    for (const FolderSearch::Folder& folder : begin) {
      if (!folder.name.empty() && matches(folder.name)) {
        add({folder.name, folder.path, EntryKind::Folder, LibraryIcon, ""});
      }
      folders.push_back({folder.path, folder.name.empty() ? "" : isolated(folder.name)});
    }
    // Breadth first: what lies near is found first.
    for (std::size_t at = 0; at < folders.size() && !*stopped_ && count_ < MostResults; ++at) {
      const Folder folder = folders[at];
      const FolderReading reading = readFolder(folder.path);
      if (!reading.snapshot) {
        waiting_.unreadable.emplace_back(folder.path, g_strerror(reading.errorNumber));
        continue;
      }
      for (std::size_t i = 0; i < reading.snapshot->size() && count_ < MostResults; ++i) {
        const std::string name(reading.snapshot->name(i));
        const EntryKind kind = reading.snapshot->kind(i);
        const std::string path = folder.path + "/" + name;
        const bool found = matches(name);
        if (!found && kind != EntryKind::Folder) continue;
        const std::string shown = takeString(g_filename_display_name(name.c_str()));
        if (found) add({shown, path, kind, "", folder.place});
        if (kind == EntryKind::Folder) {
          folders.push_back({path, folder.place.empty() ? isolated(shown) : folder.place + " ▸ " + isolated(shown)});
        }
      }
      tellIfDue();
    }
    tell(true);
  }

 private:
  struct Folder {
    std::string path;
    std::string place;
  };

  bool matches(const std::string& name) const { return folded(name).find(query_) != std::string::npos; }
  void add(FolderEntry entry) {
    ++count_;
    latest_.push_back(std::move(entry));
    tellIfDue();
  }
  void tellIfDue() {
    constexpr std::chrono::milliseconds interval(100);
    if (!latest_.empty() && std::chrono::steady_clock::now() - told_ >= interval) tell(false);
  }
  void tell(bool finished) {
    told_ = std::chrono::steady_clock::now();
    waiting_.finished = finished;
    std::sort(latest_.begin(), latest_.end(), standsBefore);
    const auto known = static_cast<std::ptrdiff_t>(entries_.size());
    entries_.insert(entries_.end(), std::make_move_iterator(latest_.begin()), std::make_move_iterator(latest_.end()));
    latest_.clear();
    std::inplace_merge(entries_.begin(), entries_.begin() + known, entries_.end(), standsBefore);
    waiting_.entries = entries_;
    auto* batch = new Batch{std::exchange(waiting_, {}), stopped_, found_};
    g_main_context_invoke_full(
        nullptr, G_PRIORITY_DEFAULT,
        [](gpointer held) -> gboolean {
          auto* shown = static_cast<Batch*>(held);
          if (!*shown->stopped) (*shown->found)(std::move(shown->report));
          return G_SOURCE_REMOVE;
        },
        batch, [](gpointer held) { delete static_cast<Batch*>(held); });
  }

  std::string query_;
  std::shared_ptr<std::atomic<bool>> stopped_;
  std::shared_ptr<FolderSearch::Found> found_;
  FolderSearch::Report waiting_;
  std::vector<FolderEntry> entries_;  // in their order
  std::vector<FolderEntry> latest_;   // not among them yet
  std::chrono::steady_clock::time_point told_;
  std::size_t count_ = 0;
};

}  // namespace

void FolderSearch::start(std::vector<Folder> folders, const std::string& query, Found found) {
  stop();
  stopped_ = std::make_shared<std::atomic<bool>>(false);
  Searching searching(folded(query), stopped_, std::make_shared<Found>(std::move(found)));
  // Detached, since a folder on a slow disk may keep it for long; it touches nothing of ours once it is stopped.
  std::thread([searching = std::move(searching), folders = std::move(folders)]() mutable {
    searching.run(folders);
  }).detach();
}

void FolderSearch::stop() {
  if (stopped_) *stopped_ = true;
}

}  // namespace vaelo
