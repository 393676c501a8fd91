// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/files/local_file_coordination.h"

#include <fcntl.h>
#include <sys/file.h>
#include <sys/stat.h>

#include <algorithm>
#include <cerrno>

#include "host/drive/small_file.h"
#include "host/support/unique_fd.h"

namespace vaelo {

struct LocalFileCoordination::Access {
  std::vector<URL> urls;
  bool writes = false;
  std::thread::id thread;
  bool underWay = false;
  /// Its thread has another access under way. It does not queue behind those that wait for that one.
  bool nested = false;

  bool excludes(const Access& other) const {
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
  enum class Kind { MetadataRead, Read, Write };

  Turn(LocalFileCoordination& owner, std::vector<URL> urls, Kind kind) : owner_(owner) {
    access_.urls = std::move(urls);
    access_.writes = kind == Kind::Write;
    access_.thread = std::this_thread::get_id();
    std::unique_lock lock(owner_.mutex_);
    access_.nested = std::any_of(owner_.accesses_.begin(), owner_.accesses_.end(),
                                 [this](const Access* other) { return other->thread == access_.thread; });
    if (!access_.nested && kind != Kind::MetadataRead) {
      // Before anything is held, so that nobody in this program waits for one who waits for another program.
      lock.unlock();
      lockBetweenPrograms(kind == Kind::Write ? LOCK_EX : LOCK_SH);
      lock.lock();
    }
    owner_.accesses_.push_back(&access_);
    if (owner_.waitsForItself(access_)) {
      std::erase(owner_.accesses_, &access_);
      error_ = fileError(access_.writes ? FileErrorCode::WriteUnknown : FileErrorCode::ReadUnknown,
                         access_.urls.front().path(), "two coordinated accesses would wait for each other");
      return;
    }
    owner_.changed_.wait(lock, [this] { return owner_.obstaclesOf(access_).empty(); });
    access_.underWay = true;
  }
  ~Turn() {
    if (lockFile_) flock(lockFile_.get(), LOCK_UN);
    {
      const std::lock_guard lock(owner_.mutex_);
      std::erase(owner_.accesses_, &access_);
      if (lockFile_) owner_.spareLock_ = std::move(lockFile_);
    }
    owner_.changed_.notify_all();
  }
  Turn(const Turn&) = delete;
  Turn& operator=(const Turn&) = delete;

  const std::optional<Error>& error() const { return error_; }

 private:
  void lockBetweenPrograms(int mode) {
    {
      const std::lock_guard lock(owner_.mutex_);
      lockFile_ = std::move(owner_.spareLock_);
    }
    // Somebody may have removed the file; then other programs lock the next one of its name.
    struct stat info {};
    if (lockFile_ && (fstat(lockFile_.get(), &info) != 0 || info.st_nlink == 0)) lockFile_ = UniqueFd();
    if (!lockFile_) lockFile_ = UniqueFd(open(owner_.lockFile_.c_str(), O_RDWR | O_CREAT | O_NOFOLLOW | O_CLOEXEC, 0600));
    while (lockFile_ && flock(lockFile_.get(), mode) != 0 && errno == EINTR) {
    }
  }

  LocalFileCoordination& owner_;
  Access access_;
  UniqueFd lockFile_;
  std::optional<Error> error_;
};

class LocalFileCoordinator : public FileCoordinator {
 public:
  LocalFileCoordinator(LocalFileCoordination& owner, FilePresenter* presenter) : owner_(owner), presenter_(presenter) {}

  std::optional<Error> coordinateReading(const URL& url, unsigned options, const Accessor& accessor) override {
    const bool metadataOnly = options & ReadingImmediatelyAvailableMetadataOnly;
    const Turn turn(owner_, {url}, metadataOnly ? Turn::Kind::MetadataRead : Turn::Kind::Read);
    if (!turn.error()) accessor(url);
    return turn.error();
  }

  std::optional<Error> coordinateWriting(const URL& url, unsigned options, const Accessor& accessor) override {
    if (options & WritingForDeleting) owner_.presenters_.itemWillBeDeleted(url, presenter_);
    const Turn turn(owner_, {url}, Turn::Kind::Write);
    if (turn.error()) return turn.error();
    accessor(url);
    if (!(options & (WritingForDeleting | WritingForMoving))) owner_.presenters_.itemChanged(url, presenter_);
    return std::nullopt;
  }

  std::optional<Error> coordinateWriting(const URL& first, unsigned, const URL& second, unsigned,
                                         const PairAccessor& accessor) override {
    const Turn turn(owner_, {first, second}, Turn::Kind::Write);
    if (!turn.error()) accessor(first, second);
    return turn.error();
  }

  /// Nothing to do: who presents the item is asked when it has moved, and none of them moves it meanwhile.
  void itemWillMove(const URL&, const URL&) override {}
  void itemDidMove(const URL& from, const URL& to) override {
    owner_.presenters_.itemMoved(from, to, presenter_);
    if (owner_.moved_) owner_.moved_(from, to);
  }

 private:
  using Turn = LocalFileCoordination::Turn;

  LocalFileCoordination& owner_;
  FilePresenter* presenter_;
};

LocalFileCoordination::LocalFileCoordination(std::string lockFile)
    : lockFile_(std::move(lockFile)), presenters_([this](const std::string& path) { return isBeingWritten(URL(path)); }) {}

bool LocalFileCoordination::isBeingWritten(const URL& item) {
  const std::lock_guard lock(mutex_);
  return std::any_of(accesses_.begin(), accesses_.end(), [&](const Access* access) {
    return access->writes && access->underWay && std::any_of(access->urls.begin(), access->urls.end(), [&](const URL& url) {
             return url.isInside(item) || item.isInside(url);
           });
  });
}

std::unique_ptr<FileCoordinator> LocalFileCoordination::makeCoordinator(FilePresenter* presenter) {
  return std::make_unique<LocalFileCoordinator>(*this, presenter);
}

void LocalFileCoordination::addFilePresenter(FilePresenter& presenter) { presenters_.add(presenter); }
void LocalFileCoordination::removeFilePresenter(FilePresenter& presenter) { presenters_.remove(presenter); }

std::vector<const LocalFileCoordination::Access*> LocalFileCoordination::obstaclesOf(const Access& access) const {
  std::vector<const Access*> obstacles;
  bool cameBefore = true;
  for (const Access* other : accesses_) {
    if (other == &access) {
      cameBefore = false;
    } else if ((other->underWay || (cameBefore && !access.nested)) && access.excludes(*other)) {
      obstacles.push_back(other);
    }
  }
  return obstacles;
}

bool LocalFileCoordination::waitsForItself(const Access& access) const {
  std::vector<const Access*> waitedFor = obstaclesOf(access);
  for (std::size_t i = 0; i < waitedFor.size(); ++i) {
    // A thread waits with one access at most, and while it does, none of its others ends.
    const std::thread::id thread = waitedFor[i]->thread;
    if (thread == access.thread) return true;
    for (const Access* other : accesses_) {
      if (other->thread != thread || other->underWay) continue;
      for (const Access* next : obstaclesOf(*other)) {
        if (std::find(waitedFor.begin(), waitedFor.end(), next) == waitedFor.end()) waitedFor.push_back(next);
      }
    }
  }
  return false;
}

}  // namespace vaelo
