// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <map>
#include <memory>
#include <mutex>
#include <vector>

#include "platform/file_coordinator.h"
#include "tests/support/call_record.h"

namespace vaelo {

/// Coordination where nobody else is in the way, except as a test chooses. Accesses run on the calling thread at once;
/// presenters are told on their queues.
class MemoryFileCoordination : public FileCoordination {
 public:
  explicit MemoryFileCoordination(CallRecord& record) : record_(record) {}

  std::optional<Error> coordinatorError;  ///< the accessor is not run then, unless errorAfterAccessor
  bool errorAfterAccessor = false;
  std::map<std::string, URL> redirected;  ///< the URL that an accessor gets for another
  std::function<void()> beforeAccessor;   ///< what another program does between request and access
  std::vector<FilePresenter*> presenters() const;
  bool isFollowedBy(const std::shared_ptr<FilePresenter>& presenter) const;

  // What other programs do: the presenters of the item hear of it on their queues; the disk is the test's own affair.
  void othersChanged(const URL& url) { tellOfChange(url, nullptr); }
  void othersMoved(const URL& from, const URL& to) { tellOfMove(from, to, nullptr); }
  /// Every answer to the notice of the deletion, as it comes, goes to `ready`.
  void othersDelete(const URL& url, FilePresenter::Completion ready = {}) { tellOfDeletion(url, nullptr, ready); }

  std::unique_ptr<FileCoordinator> makeCoordinator(FilePresenter* presenter = nullptr) override;
  void addFilePresenter(FilePresenter& presenter) override;
  void removeFilePresenter(FilePresenter& presenter) override;

 private:
  class Coordinator;
  struct Registration {
    std::recursive_mutex mutex;
    FilePresenter* presenter;  // guarded by mutex; null once removed
  };
  using Told = std::function<void(FilePresenter&)>;
  /// Those that show something, without `but`.
  std::vector<std::pair<std::shared_ptr<Registration>, URL>> shown(const FilePresenter* but) const;
  static void tell(const std::shared_ptr<Registration>& registration, Told call, bool waits = false);
  void tellOfChange(const URL& url, const FilePresenter* but);
  void tellOfMove(const URL& from, const URL& to, const FilePresenter* but);
  void tellOfDeletion(const URL& url, const FilePresenter* but, const FilePresenter::Completion& ready);

  CallRecord& record_;
  mutable std::mutex mutex_;
  std::vector<std::shared_ptr<Registration>> registrations_;  // guarded by mutex_
};

}  // namespace vaelo
