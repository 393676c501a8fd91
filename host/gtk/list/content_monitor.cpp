// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/gtk/list/content_monitor.h"

#include <glib-unix.h>
#include <sys/inotify.h>
#include <unistd.h>

#include <array>
#include <cstring>
#include <utility>

namespace vaelo {
namespace {

constexpr guint CountingPause = 250;  // milliseconds

}  // namespace

ContentMonitor::Queue::Queue() : descriptor_(inotify_init1(IN_NONBLOCK | IN_CLOEXEC)) {}

ContentMonitor::Queue::~Queue() {
  if (descriptor_ >= 0) close(descriptor_);
}

int ContentMonitor::Queue::watch(const std::string& folder) const {
  constexpr std::uint32_t comingAndGoing = IN_CREATE | IN_DELETE | IN_MOVED_FROM | IN_MOVED_TO | IN_ONLYDIR;
  return descriptor_ < 0 ? -1 : inotify_add_watch(descriptor_, folder.c_str(), comingAndGoing);
}

const std::shared_ptr<const ContentMonitor::Queue>& ContentMonitor::queue() {
  if (queue_) return queue_;
  queue_ = std::make_shared<Queue>();
  if (queue_->descriptor_ < 0) return queue_;
  source_ = g_unix_fd_add(
      queue_->descriptor_, G_IO_IN,
      [](gint, GIOCondition, gpointer self) -> gboolean {
        static_cast<ContentMonitor*>(self)->read();
        return G_SOURCE_CONTINUE;
      },
      this);
  return queue_;
}

void ContentMonitor::stop() {
  if (source_) g_source_remove(std::exchange(source_, 0));
  if (timer_) g_source_remove(std::exchange(timer_, 0));
  queue_.reset();
  keys_.clear();
  touched_.clear();
  early_.clear();
  ended_.clear();
}

void ContentMonitor::add(const std::shared_ptr<const Queue>& queue, int watch, const std::string& key) {
  if (watch < 0 || queue != queue_) return;
  keys_[watch].insert(key);
  if (early_.erase(watch) == 0) return;
  touched_.insert(watch);
  reportSoon();
}

void ContentMonitor::keep(const std::function<bool(const std::string& key)>& wanted) {
  for (auto entry = keys_.begin(); entry != keys_.end();) {
    std::erase_if(entry->second, [&](const std::string& key) { return !wanted(key); });
    if (!entry->second.empty()) {
      ++entry;
      continue;
    }
    inotify_rm_watch(queue_->descriptor_, entry->first);
    entry = keys_.erase(entry);
  }
}

void ContentMonitor::read() {
  alignas(inotify_event) std::array<char, 64 * 1024> buffer;
  const ssize_t count = ::read(queue_->descriptor_, buffer.data(), buffer.size());
  for (ssize_t offset = 0; offset < count;) {
    inotify_event event;
    std::memcpy(&event, buffer.data() + offset, sizeof event);
    offset += static_cast<ssize_t>(sizeof event + event.len);
    if (event.mask & IN_Q_OVERFLOW) {
      for (const auto& [watch, keys] : keys_) touched_.insert(watch);
    } else if (event.mask & IN_IGNORED) {
      // The folder is gone; another may stand in its place.
      if (auto ended = keys_.extract(event.wd)) ended_.merge(ended.mapped());
      early_.erase(event.wd);
    } else {
      touched_.insert(event.wd);
    }
  }
  reportSoon();
}

void ContentMonitor::reportSoon() {
  if (timer_ || (touched_.empty() && ended_.empty())) return;
  timer_ = g_timeout_add(
      CountingPause,
      [](gpointer self) -> gboolean {
        static_cast<ContentMonitor*>(self)->report();
        return G_SOURCE_REMOVE;
      },
      this);
}

void ContentMonitor::report() {
  timer_ = 0;
  std::unordered_set<std::string> changed = std::exchange(ended_, {});
  for (const int watch : std::exchange(touched_, {})) {
    const auto found = keys_.find(watch);
    if (found == keys_.end()) {
      early_.insert(watch);
    } else {
      changed.insert(found->second.begin(), found->second.end());
    }
  }
  for (const std::string& key : changed) changed_(key);
}

}  // namespace vaelo
