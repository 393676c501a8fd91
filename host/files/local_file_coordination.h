// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <condition_variable>
#include <functional>
#include <map>
#include <memory>
#include <mutex>
#include <string>
#include <thread>
#include <vector>

#include "host/files/presenter_list.h"
#include "host/support/unique_fd.h"
#include "platform/file_coordinator.h"

namespace vaelo {

/// Coordinates the accesses of this program, and of other instances of it on the same drive, to files and folders.
///
/// Within the program an access waits for those under way, and for those that came before it, to the same item, to what
/// holds it and to what it holds, unless both read. A thread may coordinate again inside an accessor: it does not wait for
/// itself. Threads that would wait for each other in a circle don't: the last one gets error 512. Between programs one lock
/// file stands for the whole drive: a write excludes all other writes and reads of content, reads of metadata alone wait for
/// nobody. Safe from any thread.
class LocalFileCoordination : public FileCoordination {
 public:
  /// `lockFile` is made when needed. Where that is not possible, other programs are not waited for.
  explicit LocalFileCoordination(std::string lockFile);
  std::unique_ptr<FileCoordinator> makeCoordinator(FilePresenter* presenter = nullptr) override;
  void addFilePresenter(FilePresenter& presenter) override;
  void removeFilePresenter(FilePresenter& presenter) override;
  /// Told of every item that this program has moved, on the thread that moved it. Set before anything moves.
  void setMoveObserver(std::function<void(const URL& from, const URL& to)> observer) { moved_ = std::move(observer); }
  /// What presenters of the item show of it is no longer what there is, though the item itself did not change.
  void tellPresenters(const URL& item) { presenters_.itemChanged(item, nullptr); }

 private:
  friend class LocalFileCoordinator;
  struct Access;
  class Turn;

  bool isBeingWritten(const URL& item);
  bool waitsForItself(const Access& access) const;
  std::vector<const Access*> obstaclesOf(const Access& access) const;

  const std::string lockFile_;
  std::function<void(const URL&, const URL&)> moved_;
  std::mutex mutex_;    // guards the three below
  UniqueFd spareLock_;  // the lock file, open and free, since opening it for each of thousands of moves takes long
  std::condition_variable changed_;
  std::vector<const Access*> accesses_;  // waiting and under way, in the order in which they came
  PresenterList presenters_;             // has its own lock; last, since it looks at the disk from a thread of its own
};

}  // namespace vaelo
