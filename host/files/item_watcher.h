// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <functional>
#include <memory>
#include <mutex>
#include <string>
#include <thread>
#include <unordered_map>
#include <vector>

#include "host/files/watched_item.h"
#include "host/support/unique_fd.h"

namespace vaelo {

/// Tells what other programs do to single items, through the kernel's notices: one inotify queue and one thread, which
/// begins with the first item. An item's news come when it has been left alone for a tenth of a second, or, while it is
/// written without pause, every tenth of a second; that something is gone, half a second after it went. A folder that can't
/// be watched changes silently, as on some network mounts. Safe from any thread.
class ItemWatcher {
 public:
  struct Item;
  using ItemRef = std::shared_ptr<Item>;
  /// Called on the watcher's thread, which may be under way in it when unwatch() returns.
  using Heard = std::function<void(const ItemNews&)>;
  /// True while somebody in this program is changing the item, who will tell of it; then it is looked at later.
  using IsBusy = std::function<bool(const std::string& path)>;

  explicit ItemWatcher(IsBusy isBusy);
  ~ItemWatcher();
  ItemWatcher(const ItemWatcher&) = delete;
  ItemWatcher& operator=(const ItemWatcher&) = delete;

  ItemRef watch(const std::string& path, Heard heard);
  /// The item is still followed, but its news are kept.
  void hold(const ItemRef& item);
  /// Tells the news that were kept, and then those to come.
  void resume(const ItemRef& item, Heard heard);
  void unwatch(const ItemRef& item);
  std::string pathOf(const ItemRef& item);

  // For what this program did itself, and has told already.
  void takeAsKnown(const ItemRef& item);
  void followTo(const ItemRef& item, const std::string& path);
  void takeDeletionAsTold(const ItemRef& item);

 private:
  using Clock = WatchedItem::Clock;
  /// A folder that the kernel watches for an item.
  struct Folder {
    std::string path;
    bool isTree = false;  // it is the item, or in it; else it is above
  };
  using Folders = std::unordered_map<int, Folder>;  // by the kernel's number

  void work();
  void read();
  void notice(int folder, unsigned mask, const std::string& name);
  void lookAtDueItems(std::unique_lock<std::mutex>& lock);
  void lookAt(const ItemRef& item, std::unique_lock<std::mutex>& lock);
  int untilNextLook() const;
  void arm(Item& item);
  void release(const Folders& folders);
  bool add(Item& item, const std::string& folder, bool isTree, unsigned mask);
  void wake();

  const IsBusy isBusy_;
  const UniqueFd queue_;
  const UniqueFd waker_;
  std::mutex mutex_;  // guards all below; held while the disk is looked at, not while anybody is told
  std::vector<ItemRef> items_;
  std::unordered_map<int, int> users_;  // of the kernel's watches: how many items have them
  bool stopping_ = false;
  std::thread thread_;
};

}  // namespace vaelo
