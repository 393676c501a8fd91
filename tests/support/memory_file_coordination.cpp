// SPDX-License-Identifier: GPL-3.0-or-later
#include "tests/support/memory_file_coordination.h"

#include <algorithm>

#include "tests/support/memory_operation_queue.h"

namespace vaelo {

class MemoryFileCoordination::Coordinator : public FileCoordinator {
 public:
  Coordinator(MemoryFileCoordination& owner, FilePresenter* presenter) : owner_(owner), presenter_(presenter) {}

  std::optional<Error> coordinateReading(const URL& url, unsigned options, const Accessor& accessor) override {
    owner_.record_.lastOptions = options;
    owner_.record_.calls.push_back("read " + url.path());
    return run([&] { accessor(given(url)); });
  }
  std::optional<Error> coordinateWriting(const URL& url, unsigned options, const Accessor& accessor) override {
    owner_.record_.calls.push_back("write " + std::to_string(options) + " " + url.path());
    if (options & WritingForDeleting) owner_.tellOfDeletion(url, presenter_, {});
    const std::optional<Error> error = run([&] { accessor(given(url)); });
    if (!error && !(options & (WritingForDeleting | WritingForMoving))) owner_.tellOfChange(url, presenter_);
    return error;
  }
  std::optional<Error> coordinateWriting(const URL& first, unsigned firstOptions, const URL& second, unsigned secondOptions,
                                         const PairAccessor& accessor) override {
    owner_.record_.calls.push_back("write " + std::to_string(firstOptions) + " " + first.path() + " " +
                                   std::to_string(secondOptions) + " " + second.path());
    return run([&] { accessor(given(first), given(second)); });
  }
  void itemWillMove(const URL& from, const URL& to) override {
    owner_.record_.calls.push_back("willMove " + from.path() + " " + to.path());
  }
  void itemDidMove(const URL& from, const URL& to) override {
    owner_.record_.calls.push_back("didMove " + from.path() + " " + to.path());
    owner_.tellOfMove(from, to, presenter_);
  }

 private:
  std::optional<Error> run(const Block& access) {
    if (!owner_.coordinatorError || owner_.errorAfterAccessor) {
      if (owner_.beforeAccessor) owner_.beforeAccessor();
      access();
    }
    return owner_.coordinatorError;
  }
  URL given(const URL& url) const {
    const auto found = owner_.redirected.find(url.path());
    return found == owner_.redirected.end() ? url : found->second;
  }

  MemoryFileCoordination& owner_;
  FilePresenter* presenter_;
};

std::vector<FilePresenter*> MemoryFileCoordination::presenters() const {
  const std::lock_guard lock(mutex_);
  std::vector<FilePresenter*> result;
  for (const auto& registration : registrations_) result.push_back(registration->presenter);
  return result;
}

std::vector<std::pair<std::shared_ptr<MemoryFileCoordination::Registration>, URL>> MemoryFileCoordination::shown(
    const FilePresenter* but) const {
  std::vector<std::shared_ptr<Registration>> all;
  {
    const std::lock_guard lock(mutex_);
    all = registrations_;
  }
  std::vector<std::pair<std::shared_ptr<Registration>, URL>> result;
  for (const auto& registration : all) {
    const std::lock_guard lock(registration->mutex);
    if (!registration->presenter || registration->presenter == but) continue;
    if (const auto url = registration->presenter->presentedItemURL()) result.emplace_back(registration, *url);
  }
  return result;
}

bool MemoryFileCoordination::isFollowedBy(const std::shared_ptr<FilePresenter>& presenter) const {
  const std::vector<FilePresenter*> all = presenters();
  return std::find(all.begin(), all.end(), presenter.get()) != all.end();
}

void MemoryFileCoordination::tellOfChange(const URL& url, const FilePresenter* but) {
  for (const auto& [registration, shownURL] : shown(but)) {
    if (url.isInside(shownURL)) {
      tell(registration, [](FilePresenter& presenter) { presenter.presentedItemDidChange(); });
    }
  }
}

void MemoryFileCoordination::tellOfMove(const URL& from, const URL& to, const FilePresenter* but) {
  for (const auto& [registration, url] : shown(but)) {
    if (!url.isInside(from)) continue;
    const URL place(to.path() + url.path().substr(from.path().size()), url.hasDirectoryPath());
    tell(registration, [place](FilePresenter& presenter) { presenter.presentedItemDidMoveToURL(place); });
  }
}

void MemoryFileCoordination::tellOfDeletion(const URL& url, const FilePresenter* but,
                                            const FilePresenter::Completion& ready) {
  const FilePresenter::Completion answered = ready ? ready : [](const std::optional<Error>&) {};
  for (const auto& [registration, shownURL] : shown(but)) {
    const bool holdsIt = url.isInside(shownURL) && !(url == shownURL);
    if (!holdsIt && !shownURL.isInside(url)) continue;
    const Told call = [holdsIt, url, answered](FilePresenter& presenter) {
      if (holdsIt) {
        presenter.accommodatePresentedSubitemDeletionAtURLCompletionHandler(url, answered);
      } else {
        presenter.accommodatePresentedItemDeletionWithCompletionHandler(answered);
      }
    };
    tell(registration, call, true);
  }
}

void MemoryFileCoordination::tell(const std::shared_ptr<Registration>& registration, Told call, bool waits) {
  std::shared_ptr<OperationQueue> queue;
  {
    const std::lock_guard lock(registration->mutex);
    if (registration->presenter) queue = registration->presenter->presentedItemOperationQueue();
  }
  if (!queue) return;
  // Not called under the lock: a presenter that leaves holds a lock of its own, which its callbacks take too.
  queue->addOperation([registration, call = std::move(call)] {
    FilePresenter* presenter = nullptr;
    {
      const std::lock_guard lock(registration->mutex);
      presenter = registration->presenter;
    }
    if (presenter) call(*presenter);
  });
  // The one who waits for an answer is not the one who runs the queue, on a real platform.
  if (auto* memoryQueue = waits ? dynamic_cast<MemoryOperationQueue*>(queue.get()) : nullptr) memoryQueue->finishNow();
}

std::unique_ptr<FileCoordinator> MemoryFileCoordination::makeCoordinator(FilePresenter* presenter) {
  record_.calls.push_back(presenter ? "coordinator of a presenter" : "coordinator");
  return std::make_unique<Coordinator>(*this, presenter);
}

void MemoryFileCoordination::addFilePresenter(FilePresenter& presenter) {
  auto registration = std::make_shared<Registration>();
  registration->presenter = &presenter;
  const std::lock_guard lock(mutex_);
  registrations_.push_back(std::move(registration));
}

void MemoryFileCoordination::removeFilePresenter(FilePresenter& presenter) {
  std::shared_ptr<Registration> removed;
  {
    const std::lock_guard lock(mutex_);
    const auto at = std::find_if(registrations_.begin(), registrations_.end(),
                                 [&](const auto& registration) { return registration->presenter == &presenter; });
    if (at == registrations_.end()) return;
    removed = *at;
    registrations_.erase(at);
  }
  const std::lock_guard lock(removed->mutex);
  removed->presenter = nullptr;
}

}  // namespace vaelo
