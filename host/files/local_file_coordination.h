// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <condition_variable>
#include <memory>
#include <mutex>
#include <string>
#include <vector>

#include "platform/file_coordinator.h"

namespace vaelo {

/// Coordinates the accesses of this program, and of other instances of it on the same drive, to files and folders. An access
/// waits for those under way to the same item, to what holds it and to what it holds, unless both read. Safe from any thread.
class LocalFileCoordination : public FileCoordination {
 public:
  /// `lockFile` is made when needed; while a write is under way other processes wait for it.
  explicit LocalFileCoordination(std::string lockFile);
  std::unique_ptr<FileCoordinator> makeCoordinator(FilePresenter* presenter = nullptr) override;
  void addFilePresenter(FilePresenter& presenter) override;
  void removeFilePresenter(FilePresenter& presenter) override;

 private:
  friend class LocalFileCoordinator;
  struct Access;
  class Turn;
  struct Registered {
    FilePresenter* presenter;  // null once removed
    std::shared_ptr<OperationQueue> queue;
    std::recursive_mutex calling;  // held while a callback runs, so that removal can wait for it
  };

  std::vector<std::shared_ptr<Registered>> presentersOf(const URL& url, FilePresenter* but, bool below);
  /// Runs `call` on the presenter's queue, unless it was removed before.
  void tell(const std::shared_ptr<Registered>& registered, std::function<void(FilePresenter&)> call);
  void tellOfDeletion(const URL& url, FilePresenter* but);

  std::string lockFile_;
  std::mutex mutex_;  // guards all below
  std::condition_variable accessEnded_;
  std::vector<const Access*> accesses_;
  std::vector<std::shared_ptr<Registered>> presenters_;
};

}  // namespace vaelo
