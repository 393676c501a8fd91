// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/gtk/list/folder_monitor.h"

#include <glib-unix.h>
#include <sys/inotify.h>
#include <unistd.h>

#include <array>
#include <cstddef>
#include <cstring>
#include <utility>

#include "host/drive/promise_file.h"

namespace vaelo {
namespace {

constexpr guint GatherMilliseconds = 100;
constexpr std::size_t MostNames = 2000;  // looking up more costs as much as reading the folder

}  // namespace

FolderMonitor::~FolderMonitor() { stop(); }

void FolderMonitor::start(const std::string& folder, std::function<void(FolderChanges)> changed,
                          std::function<void()> removed) {
  stop();
  changed_ = std::move(changed);
  removed_ = std::move(removed);
  queue_ = inotify_init1(IN_NONBLOCK | IN_CLOEXEC);
  if (queue_ < 0) return;
  if (inotify_add_watch(queue_, folder.c_str(),
                        IN_CREATE | IN_DELETE | IN_MOVED_FROM | IN_MOVED_TO | IN_CLOSE_WRITE | IN_MODIFY | IN_ATTRIB |
                            IN_DELETE_SELF | IN_MOVE_SELF | IN_ONLYDIR) < 0) {
    stop();
    return;
  }
  source_ = g_unix_fd_add(
      queue_, G_IO_IN,
      [](gint, GIOCondition, gpointer self) -> gboolean {
        static_cast<FolderMonitor*>(self)->read();
        return G_SOURCE_CONTINUE;
      },
      this);
}

void FolderMonitor::stop() {
  if (source_) g_source_remove(std::exchange(source_, 0));
  if (timer_) g_source_remove(std::exchange(timer_, 0));
  if (queue_ >= 0) close(std::exchange(queue_, -1));
  names_.clear();
  everything_ = false;
}

void FolderMonitor::read() {
  alignas(inotify_event) std::array<char, 64 * 1024> buffer;
  const ssize_t count = ::read(queue_, buffer.data(), buffer.size());
  for (ssize_t offset = 0; offset < count;) {
    inotify_event event;
    std::memcpy(&event, buffer.data() + offset, sizeof event);
    const char* name = buffer.data() + offset + sizeof event;
    offset += static_cast<ssize_t>(sizeof event + event.len);
    if (event.mask & (IN_DELETE_SELF | IN_MOVE_SELF | IN_UNMOUNT)) {
      const auto removed = removed_;
      stop();
      removed();
      return;
    }
    if (event.mask & IN_Q_OVERFLOW) everything_ = true;
    if (everything_ || !event.len || !*name) continue;
    if (*name != '.') {
      names_.insert(name);
    } else if (const auto logical = logicalNameOfShortPromise(name)) {
      names_.insert(*logical);
    } else if (isPromiseName(name)) {
      everything_ = true;  // the item's name went with the file
    }
    if (names_.size() > MostNames) everything_ = true;
  }
  if (!timer_ && (everything_ || !names_.empty())) {
    timer_ = g_timeout_add(
        GatherMilliseconds,
        [](gpointer self) -> gboolean {
          static_cast<FolderMonitor*>(self)->report();
          return G_SOURCE_REMOVE;
        },
        this);
  }
}

void FolderMonitor::report() {
  timer_ = 0;
  FolderChanges changes;
  changes.everything = std::exchange(everything_, false);
  if (!changes.everything) changes.names.assign(names_.begin(), names_.end());
  names_.clear();
  const auto changed = changed_;
  changed(std::move(changes));
}

}  // namespace vaelo
