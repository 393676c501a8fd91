// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <atomic>
#include <chrono>
#include <condition_variable>
#include <deque>
#include <functional>
#include <memory>
#include <mutex>
#include <string>
#include <thread>

#include "host/support/unique_fd.h"
#include "platform/logging.h"
#include "platform/queues.h"

namespace vaelo {

/// Removes folders: out of the tree at once by one rename, and from the disk afterwards on a thread of its own. So whatever
/// happens in between, there is never half a folder in its place. What a process could not finish, the next one does.
///
/// A large folder waits for some seconds before its first item goes, and its progress is told, so that whoever deleted it by
/// mistake gets it back whole. Safe from any thread, but for the observer.
class TreeRemovals {
 public:
  struct Timing {
    std::size_t large = 1000;              ///< a folder with this many items is large
    std::chrono::milliseconds wait{3000};  ///< how long a large one is kept whole
  };
  enum class Stage {
    Waiting,   ///< whole, and about to go
    Removing,  ///< told some ten times a second
    Removed,
    PutBack,  ///< cancelled: what is left is at `place` again
    Failed,   ///< what can't be removed is at `place` again, or where the log says
  };
  struct News {
    std::string name;  ///< the folder's, as bytes
    Stage stage;
    std::size_t total;    ///< items in it, and itself
    std::size_t removed;  ///< of these
    std::string place;
  };
  using Observer = std::function<void(const News&)>;

  /// `place` is a folder on the drive's own file system, made when needed, in which every process has one of its own for
  /// what is on its way out. `log` and `queues` outlive this.
  TreeRemovals(std::string place, LogSink& log, Queues& queues) : TreeRemovals(std::move(place), log, queues, Timing()) {}
  TreeRemovals(std::string place, LogSink& log, Queues& queues, Timing timing);
  /// Doesn't wait for what is not removed yet.
  ~TreeRemovals();
  TreeRemovals(const TreeRemovals&) = delete;
  TreeRemovals& operator=(const TreeRemovals&) = delete;

  /// Takes the folder at `path` out of its place. Answers 0, or the error number, and then it is where it was. A `quiet` one
  /// is neither told of nor can it be cancelled.
  int remove(const std::string& path, bool quiet = false);
  /// Puts all that is not removed yet back to its place. What is gone is gone, and is told.
  void cancel();
  /// Called on the main queue for large folders, and for any that can't be removed. Main thread.
  void setObserver(Observer observer) { *observer_ = std::move(observer); }

 private:
  struct Job {
    std::string from;    ///< the place in the tree
    std::string held;    ///< the place outside of it
    std::string record;  ///< a link that says where `held` is, when that is in no folder of ours
    unsigned number;
    bool quiet;
  };
  bool makeOwnFolder();
  int takeOut(Job& job);
  void work();
  void removeLeftovers();
  void removeHeld(const std::string& held);
  void process(const Job& job);
  bool isCancelled(const Job& job) const { return !job.quiet && job.number < cancelledBelow_; }
  std::string putBack(const Job& job);
  void tell(const Job& job, Stage stage, std::size_t total, std::size_t removed, std::string place = {});

  const std::string place_;
  LogSink& log_;
  Queues& queues_;
  const Timing timing_;
  const std::shared_ptr<Observer> observer_ = std::make_shared<Observer>();
  std::atomic<bool> stopping_ = false;
  std::atomic<unsigned> cancelledBelow_ = 0;
  std::mutex mutex_;  // guards all below
  std::condition_variable changed_;
  std::deque<Job> jobs_;
  unsigned next_ = 1;
  std::string ownFolder_;
  UniqueFd ownLock_;  // tells other processes that this one lives
  bool leftovers_ = false;
  std::thread thread_;
};

}  // namespace vaelo
