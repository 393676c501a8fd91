// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/files/tree_removals.h"

#include <dirent.h>
#include <fcntl.h>
#include <glib.h>
#include <linux/fs.h>
#include <sys/file.h>
#include <sys/stat.h>
#include <unistd.h>

#include <cerrno>
#include <cstdio>
#include <cstring>
#include <filesystem>
#include <utility>

#include "host/files/tree_walk.h"
#include "platform/url.h"

namespace vaelo {

namespace {

// What stands beside the place that it left, since no other place would take it.
constexpr const char* HeldBeside = ".vaelo-removing-";
constexpr std::chrono::milliseconds TellInterval{100};

std::string randomName() {
  char name[24];
  std::snprintf(name, sizeof name, "%08x%08x", g_random_int(), g_random_int());
  return name;
}

std::string folderOf(const std::string& path) { return URL(path).deletingLastPathComponent().path(); }

int renameExclusively(const std::string& from, const std::string& to) {
  if (renameat2(AT_FDCWD, from.c_str(), AT_FDCWD, to.c_str(), RENAME_NOREPLACE) == 0) return 0;
  if (errno != EINVAL) return errno;
  // Network file systems don't know the flag.
  struct stat info {};
  if (lstat(to.c_str(), &info) == 0) return EEXIST;
  return ::rename(from.c_str(), to.c_str()) == 0 ? 0 : errno;
}

void flushFolder(const std::string& path) {
  const UniqueFd folder(open(path.c_str(), O_RDONLY | O_DIRECTORY | O_CLOEXEC));
  if (folder) fsync(folder.get());
}

/// "NAME", "NAME 2", "NAME 3" ... before the extension.
std::string numbered(const std::string& path, int number) {
  if (number == 1) return path;
  const std::string extension = URL(path).pathExtension();
  const std::string stem = extension.empty() ? path : path.substr(0, path.size() - extension.size() - 1);
  return stem + " " + std::to_string(number) + (extension.empty() ? "" : "." + extension);
}

bool hasEntries(const std::string& folder) {
  std::error_code failure;
  return std::filesystem::directory_iterator(folder, failure) != std::filesystem::directory_iterator();
}

}  // namespace

TreeRemovals::TreeRemovals(std::string place, LogSink& log, Queues& queues, Timing timing)
    : place_(std::move(place)), log_(log), queues_(queues), timing_(timing), leftovers_(hasEntries(place_)) {
  if (leftovers_) thread_ = std::thread([this] { work(); });
}

TreeRemovals::~TreeRemovals() {
  stopping_ = true;
  { const std::lock_guard lock(mutex_); }
  changed_.notify_all();
  if (thread_.joinable()) thread_.join();
  if (!ownFolder_.empty()) rmdir(ownFolder_.c_str());
}

bool TreeRemovals::makeOwnFolder() {
  for (int attempt = 0; ownFolder_.empty() && attempt < 3; ++attempt) {
    const std::string folder = place_ + "/" + randomName();
    if (g_mkdir_with_parents(folder.c_str(), 0700) != 0) return false;
    UniqueFd lock(open(folder.c_str(), O_RDONLY | O_DIRECTORY | O_NOFOLLOW | O_CLOEXEC));
    // A process that looks for leftovers may have taken it for one in this moment.
    struct stat here {};
    struct stat named {};
    if (lock && flock(lock.get(), LOCK_EX | LOCK_NB) == 0 && fstat(lock.get(), &here) == 0 &&
        stat(folder.c_str(), &named) == 0 && here.st_ino == named.st_ino) {
      ownFolder_ = folder;
      ownLock_ = std::move(lock);
    }
  }
  return !ownFolder_.empty();
}

int TreeRemovals::takeOut(Job& job) {
  const std::string name = std::to_string(job.number);
  const bool own = makeOwnFolder();
  if (own) {
    job.held = ownFolder_ + "/" + name;
    const int number = renameExclusively(job.from, job.held);
    // Another file system, or a folder whose own permissions let it move within its parent only.
    if (number != EXDEV && number != EACCES && number != EPERM) return number;
  }
  job.held = folderOf(job.from) + "/" + HeldBeside + randomName();
  if (own) {
    job.record = ownFolder_ + "/" + name + ".link";
    if (symlink(job.held.c_str(), job.record.c_str()) != 0) job.record.clear();
  }
  const int number = renameExclusively(job.from, job.held);
  if (number != 0 && !job.record.empty()) unlink(job.record.c_str());
  return number;
}

int TreeRemovals::remove(const std::string& path, bool quiet) {
  if (rmdir(path.c_str()) == 0) return 0;
  const std::lock_guard lock(mutex_);
  Job job{path, {}, {}, next_++, quiet};
  if (const int number = takeOut(job)) return number;
  jobs_.push_back(std::move(job));
  if (!thread_.joinable()) thread_ = std::thread([this] { work(); });
  changed_.notify_all();
  return 0;
}

void TreeRemovals::cancel() {
  {
    const std::lock_guard lock(mutex_);
    cancelledBelow_ = next_;
  }
  changed_.notify_all();
}

void TreeRemovals::work() {
  if (leftovers_) removeLeftovers();
  for (;;) {
    std::unique_lock lock(mutex_);
    changed_.wait(lock, [this] { return stopping_ || !jobs_.empty(); });
    if (stopping_) return;
    const Job job = std::move(jobs_.front());
    jobs_.pop_front();
    lock.unlock();
    process(job);
  }
}

void TreeRemovals::removeLeftovers() {
  std::error_code failure;
  int removed = 0;
  for (std::filesystem::directory_iterator folder(place_, failure), end; !failure && folder != end && !stopping_;
       folder.increment(failure)) {
    const std::string path = folder->path();
    const UniqueFd lock(open(path.c_str(), O_RDONLY | O_DIRECTORY | O_NOFOLLOW | O_CLOEXEC));
    // Its process lives, maybe on the other side of a mirror that two share.
    if (!lock || flock(lock.get(), LOCK_EX | LOCK_NB) != 0) continue;
    std::error_code unreadable;
    for (std::filesystem::directory_iterator entry(path, unreadable); !unreadable && entry != end && !stopping_;
         entry.increment(unreadable)) {
      removeHeld(entry->path());
      ++removed;
    }
    rmdir(path.c_str());
  }
  if (removed > 0) {
    log_.write(LogType::Default, "drive: folders that were deleted before are removed now: " + std::to_string(removed));
  }
}

void TreeRemovals::removeHeld(const std::string& held) {
  char target[4096];
  const ssize_t length = readlink(held.c_str(), target, sizeof target);
  const std::string beside = length > 0 ? std::string(target, static_cast<std::size_t>(length)) : std::string();
  const auto goOn = [this] { return !stopping_.load(); };
  // A link that leads anywhere else was not made here.
  int number = 0;
  if (URL(beside).lastPathComponent().starts_with(HeldBeside)) number = removeTreeWhile(beside, goOn);
  if (number == 0 || number == ENOENT) number = removeTreeWhile(held, goOn);
  if (number != 0 && number != ECANCELED) {
    log_.write(LogType::Error, "drive: can't remove " + held + ": " + std::strerror(number));
  }
}

void TreeRemovals::process(const Job& job) {
  const auto goOn = [this, &job] { return !stopping_ && !isCancelled(job); };
  // The disk must know that it left its place before it learns that its items are gone.
  flushFolder(folderOf(job.from));
  flushFolder(folderOf(job.held));
  const std::size_t total = job.quiet ? 0 : countTree(job.held, goOn);
  const bool large = !job.quiet && total >= timing_.large;
  if (large) {
    tell(job, Stage::Waiting, total, 0);
    std::unique_lock lock(mutex_);
    changed_.wait_for(lock, timing_.wait, [&goOn] { return !goOn(); });
  }
  std::size_t removed = 0;
  auto told = std::chrono::steady_clock::now();
  const int number = removeTreeWhile(job.held, [&] {
    if (!goOn()) return false;
    ++removed;
    const auto now = std::chrono::steady_clock::now();
    if (large && now - told >= TellInterval) {
      told = now;
      tell(job, Stage::Removing, total, removed);
    }
    return true;
  });
  if (number == ECANCELED && !isCancelled(job)) return;  // the program ends
  if (!job.record.empty()) unlink(job.record.c_str());
  if (number == 0) {
    if (large) tell(job, Stage::Removed, total, total);
    return;
  }
  // Deeper folders count as begun, and are still there.
  if (number != ECANCELED) {
    log_.write(LogType::Error, "drive: can't remove what was in " + job.from + ": " + std::strerror(number));
    removed = total - std::min(total, countTree(job.held, [] { return true; }));
  }
  tell(job, number == ECANCELED ? Stage::PutBack : Stage::Failed, total, removed, putBack(job));
}

std::string TreeRemovals::putBack(const Job& job) {
  g_mkdir_with_parents(folderOf(job.from).c_str(), 0777);
  constexpr int most = 100;
  int number = EEXIST;
  for (int i = 1; i < most && number == EEXIST; ++i) {
    const std::string place = numbered(job.from, i);
    number = renameExclusively(job.held, place);
    if (number == 0) return place;
  }
  log_.write(LogType::Error,
             "drive: " + job.from + " can't be put back, it is at " + job.held + ": " + std::strerror(number));
  return job.held;
}

void TreeRemovals::tell(const Job& job, Stage stage, std::size_t total, std::size_t removed, std::string place) {
  if (job.quiet) return;
  queues_.main().async([weak = std::weak_ptr(observer_),
                        news = News{URL(job.from).lastPathComponent(), stage, total, removed, std::move(place)}] {
    const auto observer = weak.lock();
    if (observer && *observer) (*observer)(news);
  });
}

}  // namespace vaelo
