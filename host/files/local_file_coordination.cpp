// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/files/local_file_coordination.h"

#include <fcntl.h>
#include <sys/file.h>

#include <algorithm>
#include <thread>

#include "host/support/unique_fd.h"

namespace vaelo {

struct LocalFileCoordination::Access {
  std::vector<URL> urls;
  bool writes;
  std::thread::id thread;

  bool excludes(const Access& other) const {
    // One thread never waits for itself: an accessor may coordinate again.
    if ((!writes && !other.writes) || thread == other.thread) return false;
    return std::any_of(urls.begin(), urls.end(), [&](const URL& mine) {
      return std::any_of(other.urls.begin(), other.urls.end(),
                         [&](const URL& theirs) { return mine.isInside(theirs) || theirs.isInside(mine); });
    });
  }
};

/// Waits for its turn when made; gives it up when it goes.
class LocalFileCoordination::Turn {
 public:
  Turn(LocalFileCoordination& owner, std::vector<URL> urls, bool writes)
      : owner_(owner), access_{std::move(urls), writes, std::this_thread::get_id()} {
    std::unique_lock lock(owner_.mutex_);
    const auto blocked = [this] {
      return std::any_of(owner_.accesses_.begin(), owner_.accesses_.end(),
                         [this](const Access* other) { return access_.excludes(*other); });
    };
    owner_.accessEnded_.wait(lock, [&] { return !blocked(); });
    const bool nested = std::any_of(owner_.accesses_.begin(), owner_.accesses_.end(),
                                    [this](const Access* other) { return other->thread == access_.thread; });
    owner_.accesses_.push_back(&access_);
    lock.unlock();
    if (writes && !nested) {
      lockFile_ = UniqueFd(open(owner_.lockFile_.c_str(), O_RDWR | O_CREAT | O_CLOEXEC, 0600));
      // Without a lock file (a full or read-only disk) only the other instances are not waited for.
      while (lockFile_ && flock(lockFile_.get(), LOCK_EX) != 0 && errno == EINTR) {
      }
    }
  }
  ~Turn() {
    {
      const std::lock_guard lock(owner_.mutex_);
      std::erase(owner_.accesses_, &access_);
    }
    owner_.accessEnded_.notify_all();
  }
  Turn(const Turn&) = delete;
  Turn& operator=(const Turn&) = delete;

 private:
  LocalFileCoordination& owner_;
  Access access_;
  UniqueFd lockFile_;
};

class LocalFileCoordinator : public FileCoordinator {
 public:
  LocalFileCoordinator(LocalFileCoordination& owner, FilePresenter* presenter) : owner_(owner), presenter_(presenter) {}

  std::optional<Error> coordinateReading(const URL& url, unsigned, const Accessor& accessor) override {
    const LocalFileCoordination::Turn turn(owner_, {url}, false);
    accessor(url);
    return std::nullopt;
  }

  std::optional<Error> coordinateWriting(const URL& url, unsigned options, const Accessor& accessor) override {
    if (options & WritingForDeleting) owner_.tellOfDeletion(url, presenter_);
    const LocalFileCoordination::Turn turn(owner_, {url}, true);
    accessor(url);
    if (!(options & (WritingForDeleting | WritingForMoving))) {
      for (const auto& registered : owner_.presentersOf(url, presenter_, false)) {
        owner_.tell(registered, [](FilePresenter& presenter) { presenter.presentedItemDidChange(); });
      }
    }
    return std::nullopt;
  }

  std::optional<Error> coordinateWriting(const URL& first, unsigned, const URL& second, unsigned,
                                         const PairAccessor& accessor) override {
    const LocalFileCoordination::Turn turn(owner_, {first, second}, true);
    accessor(first, second);
    return std::nullopt;
  }

  void itemWillMove(const URL&, const URL&) override {}

  void itemDidMove(const URL& from, const URL& to) override {
    for (const auto& registered : owner_.presentersOf(from, presenter_, true)) {
      owner_.tell(registered, [from, to](FilePresenter& presenter) {
        const std::optional<URL> shown = presenter.presentedItemURL();
        if (shown && shown->isInside(from)) {
          presenter.presentedItemDidMoveToURL(URL(to.path() + shown->path().substr(from.path().size())));
        }
      });
    }
  }

 private:
  LocalFileCoordination& owner_;
  FilePresenter* presenter_;
};

LocalFileCoordination::LocalFileCoordination(std::string lockFile) : lockFile_(std::move(lockFile)) {}

std::unique_ptr<FileCoordinator> LocalFileCoordination::makeCoordinator(FilePresenter* presenter) {
  return std::make_unique<LocalFileCoordinator>(*this, presenter);
}

void LocalFileCoordination::addFilePresenter(FilePresenter& presenter) {
  auto registered = std::make_shared<Registered>();
  registered->presenter = &presenter;
  registered->queue = presenter.presentedItemOperationQueue();
  const std::lock_guard lock(mutex_);
  presenters_.push_back(std::move(registered));
}

void LocalFileCoordination::removeFilePresenter(FilePresenter& presenter) {
  std::shared_ptr<Registered> found;
  {
    const std::lock_guard lock(mutex_);
    const auto at = std::find_if(presenters_.begin(), presenters_.end(),
                                 [&](const auto& registered) { return registered->presenter == &presenter; });
    if (at == presenters_.end()) return;
    found = *at;
    presenters_.erase(at);
  }
  // Recursive, since a presenter may remove itself inside its own callback.
  const std::lock_guard calling(found->calling);
  found->presenter = nullptr;
}

std::vector<std::shared_ptr<LocalFileCoordination::Registered>> LocalFileCoordination::presentersOf(const URL& url,
                                                                                                    FilePresenter* but,
                                                                                                    bool below) {
  std::vector<std::shared_ptr<Registered>> all;
  {
    const std::lock_guard lock(mutex_);
    all = presenters_;
  }
  std::erase_if(all, [&](const std::shared_ptr<Registered>& registered) {
    const std::lock_guard calling(registered->calling);
    if (!registered->presenter || registered->presenter == but) return true;
    const std::optional<URL> shown = registered->presenter->presentedItemURL();
    return !shown || !(below ? shown->isInside(url) : *shown == url);
  });
  return all;
}

void LocalFileCoordination::tell(const std::shared_ptr<Registered>& registered, std::function<void(FilePresenter&)> call) {
  registered->queue->addOperation([registered, call = std::move(call)] {
    const std::lock_guard calling(registered->calling);
    if (registered->presenter) call(*registered->presenter);
  });
}

void LocalFileCoordination::tellOfDeletion(const URL& url, FilePresenter* but) {
  for (const auto& registered : presentersOf(url, but, true)) {
    struct Answer {
      std::mutex mutex;
      std::condition_variable changed;
      bool given = false;
    };
    const auto answer = std::make_shared<Answer>();
    tell(registered, [answer](FilePresenter& presenter) {
      presenter.accommodatePresentedItemDeletionWithCompletionHandler([answer](std::optional<Error>) {
        const std::lock_guard lock(answer->mutex);
        answer->given = true;
        answer->changed.notify_all();
      });
    });
    // A presenter that does not answer must not keep the user from deleting.
    constexpr std::chrono::seconds patience(1);
    std::unique_lock lock(answer->mutex);
    answer->changed.wait_for(lock, patience, [&] { return answer->given; });
  }
}

}  // namespace vaelo
