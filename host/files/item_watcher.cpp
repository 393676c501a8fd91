// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/files/item_watcher.h"

#include <dirent.h>
#include <poll.h>
#include <sys/eventfd.h>
#include <sys/inotify.h>
#include <unistd.h>

#include <algorithm>
#include <array>
#include <cstring>
#include <optional>
#include <utility>

namespace vaelo {

namespace {

constexpr std::chrono::milliseconds Settling(100);
constexpr std::size_t MostFolders = 256;    // of one item's tree
constexpr std::size_t MostEntries = 20000;  // that are read to find them
constexpr unsigned OwnMoves = IN_MOVE_SELF | IN_DELETE_SELF;
constexpr unsigned Entries = IN_CREATE | IN_DELETE | IN_MOVED_FROM | IN_MOVED_TO | IN_CLOSE_WRITE | IN_MODIFY | IN_ATTRIB;

std::vector<std::string> foldersIn(const std::string& folder, std::size_t& entries) {
  std::vector<std::string> found;
  const std::unique_ptr<DIR, int (*)(DIR*)> stream(::opendir(folder.c_str()), ::closedir);
  if (!stream) return found;
  while (const dirent* entry = entries < MostEntries ? ::readdir(stream.get()) : nullptr) {
    ++entries;
    const std::string name = entry->d_name;
    if (name != "." && name != ".." && entry->d_type == DT_DIR) found.push_back(folder + "/" + name);
  }
  return found;
}

}  // namespace

struct ItemWatcher::Item {
  explicit Item(const std::string& path) : state(path) {}

  WatchedItem state;
  Heard heard;  // none while the news are kept
  ItemNews kept;
  Folders folders;
  bool needsArming = false;
  bool unwatched = false;
  std::optional<Clock::time_point> due;

  void keep(ItemNews news) {
    kept.changed |= news.changed;
    kept.deleted |= news.deleted;
    if (news.movedTo) kept.movedTo = std::move(news.movedTo);
    kept.deletedInside.insert(kept.deletedInside.end(), news.deletedInside.begin(), news.deletedInside.end());
  }
  void lookSoon(Clock::duration delay) {
    if (!due) due = Clock::now() + delay;
  }
};

ItemWatcher::ItemWatcher(IsBusy isBusy)
    : isBusy_(std::move(isBusy)),
      queue_(inotify_init1(IN_NONBLOCK | IN_CLOEXEC)),
      waker_(eventfd(0, EFD_NONBLOCK | EFD_CLOEXEC)) {}

ItemWatcher::~ItemWatcher() {
  {
    const std::lock_guard lock(mutex_);
    stopping_ = true;
  }
  wake();
  if (thread_.joinable()) thread_.join();
}

ItemWatcher::ItemRef ItemWatcher::watch(const std::string& path, Heard heard) {
  const std::lock_guard lock(mutex_);
  const auto item = std::make_shared<Item>(path);
  item->heard = std::move(heard);
  arm(*item);
  // What happened between the first look and the kernel's watch.
  item->lookSoon(Settling);
  items_.push_back(item);
  if (!thread_.joinable()) thread_ = std::thread([this] { work(); });
  wake();
  return item;
}

void ItemWatcher::hold(const ItemRef& item) {
  const std::lock_guard lock(mutex_);
  item->heard = nullptr;
}

void ItemWatcher::resume(const ItemRef& item, Heard heard) {
  const std::lock_guard lock(mutex_);
  item->heard = std::move(heard);
  item->lookSoon({});
  wake();
}

void ItemWatcher::unwatch(const ItemRef& item) {
  const std::lock_guard lock(mutex_);
  if (std::erase(items_, item) == 0) return;
  item->heard = nullptr;
  item->unwatched = true;
  release(std::exchange(item->folders, {}));
}

std::string ItemWatcher::pathOf(const ItemRef& item) {
  const std::lock_guard lock(mutex_);
  return item->state.path();
}

void ItemWatcher::takeAsKnown(const ItemRef& item) {
  const std::lock_guard lock(mutex_);
  item->state.takeAsKnown();
}

void ItemWatcher::followTo(const ItemRef& item, const std::string& path) {
  const std::lock_guard lock(mutex_);
  item->state.followTo(path);
  item->needsArming = true;
  item->lookSoon(Settling);
  wake();
}

void ItemWatcher::takeDeletionAsTold(const ItemRef& item) {
  const std::lock_guard lock(mutex_);
  item->state.takeDeletionAsTold();
}

void ItemWatcher::wake() {
  const std::uint64_t one = 1;
  [[maybe_unused]] const ssize_t written = ::write(waker_.get(), &one, sizeof one);
}

void ItemWatcher::work() {
  std::unique_lock lock(mutex_);
  while (!stopping_) {
    const int patience = untilNextLook();
    lock.unlock();
    std::array<pollfd, 2> waited = {{{queue_.get(), POLLIN, 0}, {waker_.get(), POLLIN, 0}}};
    ::poll(waited.data(), waited.size(), patience);
    std::uint64_t count = 0;
    [[maybe_unused]] const ssize_t woken = ::read(waker_.get(), &count, sizeof count);
    lock.lock();
    read();
    lookAtDueItems(lock);
  }
}

int ItemWatcher::untilNextLook() const {
  std::optional<Clock::time_point> next;
  for (const ItemRef& item : items_) {
    if (item->due) next = std::min(next.value_or(*item->due), *item->due);
  }
  if (!next) return -1;
  const auto wait = std::chrono::ceil<std::chrono::milliseconds>(*next - Clock::now()).count();
  return static_cast<int>(std::max<std::int64_t>(wait, 0));
}

void ItemWatcher::read() {
  alignas(inotify_event) std::array<char, 64 * 1024> buffer;
  const ssize_t count = ::read(queue_.get(), buffer.data(), buffer.size());
  for (ssize_t offset = 0; offset < count;) {
    inotify_event event;
    std::memcpy(&event, buffer.data() + offset, sizeof event);
    notice(event.wd, event.mask, event.len ? buffer.data() + offset + sizeof event : "");
    offset += static_cast<ssize_t>(sizeof event + event.len);
  }
}

void ItemWatcher::notice(int folder, unsigned mask, const std::string& name) {
  if (mask & IN_IGNORED) {
    users_.erase(folder);
    for (const ItemRef& item : items_) item->folders.erase(folder);
    return;
  }
  for (const ItemRef& item : items_) {
    WatchedItem& state = item->state;
    if (mask & IN_Q_OVERFLOW) {
      item->needsArming = true;
      state.sawInside();
      item->lookSoon(Settling);
      continue;
    }
    const auto found = item->folders.find(folder);
    if (found == item->folders.end()) continue;
    const auto& [path, isTree] = found->second;
    if (mask & (OwnMoves | IN_UNMOUNT)) {
      item->needsArming = true;
    } else if (!isTree) {
      if (path != state.folder() || !state.concerns(name)) continue;
    } else if (mask & (IN_DELETE | IN_MOVED_FROM)) {
      state.sawRemoval(path + "/" + name);
    } else if (mask & IN_ATTRIB) {
      continue;  // of what an item holds nobody shows attributes
    } else if (mask & (IN_CREATE | IN_MOVED_TO)) {
      state.sawArrival(path + "/" + name);
      if (mask & IN_ISDIR) item->needsArming = true;
    } else {
      state.sawInside();
    }
    item->lookSoon(Settling);
  }
}

void ItemWatcher::lookAtDueItems(std::unique_lock<std::mutex>& lock) {
  const Clock::time_point now = Clock::now();
  for (const ItemRef& item : std::vector(items_)) {
    if (stopping_) return;
    if (item->due && *item->due <= now) lookAt(item, lock);
  }
}

void ItemWatcher::lookAt(const ItemRef& item, std::unique_lock<std::mutex>& lock) {
  const std::string path = item->state.path();
  item->due.reset();
  lock.unlock();
  const bool busy = isBusy_(path);
  lock.lock();
  if (item->unwatched) return;
  if (busy) return item->lookSoon(Settling);
  if (std::exchange(item->needsArming, false)) arm(*item);
  const bool wasFolder = item->state.isFolder();
  item->keep(item->state.look(Clock::now()));
  if (item->state.path() != path || item->state.isFolder() != wasFolder) {
    arm(*item);
    item->lookSoon(Settling);  // for what happened before the kernel watched
  }
  if (const auto again = item->state.lookAgainAt()) item->due = std::min(item->due.value_or(*again), *again);
  if (!item->heard || !item->kept.any()) return;
  const Heard heard = item->heard;
  const ItemNews news = std::exchange(item->kept, {});
  lock.unlock();
  heard(news);
  lock.lock();
}

// Adding again what is watched already is how its path is learnt anew.
void ItemWatcher::arm(Item& item) {
  const Folders before = std::exchange(item.folders, {});
  const std::string& path = item.state.path();
  add(item, item.state.folder(), false, OwnMoves | Entries);
  for (std::size_t slash = item.state.folder().rfind('/'); slash != std::string::npos && slash != 0;
       slash = path.rfind('/', slash - 1)) {
    add(item, path.substr(0, slash), false, OwnMoves);
  }
  if (item.state.isFolder()) {
    std::vector<std::string> pending = {path};
    std::size_t entries = 0;
    while (!pending.empty() && item.folders.size() < MostFolders) {
      const std::string folder = std::move(pending.back());
      pending.pop_back();
      if (!add(item, folder, true, OwnMoves | Entries)) continue;
      for (std::string& inside : foldersIn(folder, entries)) pending.push_back(std::move(inside));
    }
  }
  for (const auto& [watch, folder] : item.folders) ++users_[watch];
  release(before);
}

bool ItemWatcher::add(Item& item, const std::string& folder, bool isTree, unsigned mask) {
  const int watch = inotify_add_watch(queue_.get(), folder.empty() ? "/" : folder.c_str(),
                                      mask | IN_ONLYDIR | IN_EXCL_UNLINK | IN_MASK_ADD);
  if (watch < 0) return false;
  item.folders.insert_or_assign(watch, Folder{folder, isTree});
  return true;
}

void ItemWatcher::release(const Folders& folders) {
  for (const auto& [watch, folder] : folders) {
    // The kernel has taken back that of a folder which is gone.
    const auto users = users_.find(watch);
    if (users == users_.end() || --users->second > 0) continue;
    users_.erase(users);
    inotify_rm_watch(queue_.get(), watch);
  }
}

}  // namespace vaelo
