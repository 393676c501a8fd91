// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <glib.h>

#include <functional>
#include <memory>
#include <string>
#include <unordered_map>
#include <unordered_set>
#include <utility>

namespace vaelo {

/// Tells in which of the watched folders items came or went, without saying which items. Main thread, but for watch().
///
/// What happens is gathered for a quarter of a second: who is told counts the folder anew, which is not worth doing for each
/// of thousands of files that are copied into it.
class ContentMonitor {
 public:
  /// `changed` is called with each folder's own key.
  explicit ContentMonitor(std::function<void(const std::string& key)> changed) : changed_(std::move(changed)) {}
  ~ContentMonitor() { stop(); }
  ContentMonitor(const ContentMonitor&) = delete;
  ContentMonitor& operator=(const ContentMonitor&) = delete;

  /// What a thread watches folders by.
  class Queue {
   public:
    Queue();
    ~Queue();
    Queue(const Queue&) = delete;
    Queue& operator=(const Queue&) = delete;
    /// Looks the folder up on its disk. A negative number when it can't be watched. Any thread.
    int watch(const std::string& folder) const;

   private:
    friend class ContentMonitor;
    int descriptor_;
  };
  /// Another one after stop(): the system has few for a person, and gives one to whoever asks here.
  const std::shared_ptr<const Queue>& queue();

  /// Tells changes of the folder that `queue` gave the number `watch` by `key`; one folder may be told by several. Nothing
  /// happens when the queue was stopped meanwhile.
  void add(const std::shared_ptr<const Queue>& queue, int watch, const std::string& key);
  /// Forgets the folders by whose keys nobody wants to be told.
  void keep(const std::function<bool(const std::string& key)>& wanted);
  /// Forgets all folders.
  void stop();
  std::size_t size() const { return keys_.size(); }

 private:
  void read();
  void reportSoon();
  void report();

  std::shared_ptr<const Queue> queue_;  // null while nothing is watched
  std::function<void(const std::string&)> changed_;
  std::unordered_map<int, std::unordered_set<std::string>> keys_;  // by watch
  std::unordered_set<int> touched_;                                // watches
  std::unordered_set<int> early_;                                  // touched before they were added
  std::unordered_set<std::string> ended_;                          // keys
  guint source_ = 0;
  guint timer_ = 0;
};

}  // namespace vaelo
