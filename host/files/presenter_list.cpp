// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/files/presenter_list.h"

#include <algorithm>
#include <condition_variable>
#include <thread>

namespace vaelo {

struct PresenterList::Registration {
  std::mutex mutex;  // guards all below
  std::condition_variable answered;
  FilePresenter* presenter = nullptr;  // null once removed
  std::shared_ptr<OperationQueue> queue;
  ItemWatcher::ItemRef item;  // null while it presents nothing
  int questions = 0;          // being asked, on any thread, where it is; the removal waits for those
};

namespace {

/// Answers to come, with one deadline for all of them.
struct Answers {
  std::mutex mutex;
  std::condition_variable changed;
  std::size_t missing = 0;
};

}  // namespace

void PresenterList::add(FilePresenter& presenter) {
  auto registration = std::make_shared<Registration>();
  registration->presenter = &presenter;
  registration->queue = presenter.presentedItemOperationQueue();
  {
    const std::lock_guard lock(mutex_);
    registrations_.push_back(registration);
  }
  if (const std::optional<URL> url = presenter.presentedItemURL()) watchDisk(registration, presenter, *url);
}

void PresenterList::watchDisk(const std::shared_ptr<Registration>& registration, const FilePresenter& presenter,
                              const URL& url) {
  Left left;
  {
    const std::lock_guard lock(mutex_);
    left = std::exchange(left_, {});
  }
  const bool comesBack = left.item && left.presenter == &presenter && left.path == url.path();
  if (left.item && !comesBack) watcher_.unwatch(left.item);
  const ItemWatcher::ItemRef item = comesBack ? left.item : watcher_.watch(url.path(), hearing(registration));
  bool stays = false;
  {
    const std::lock_guard lock(registration->mutex);
    stays = registration->presenter != nullptr;
    if (stays) registration->item = item;
  }
  if (!stays) return watcher_.unwatch(item);
  if (comesBack) watcher_.resume(item, hearing(registration));
}

ItemWatcher::Heard PresenterList::hearing(const std::shared_ptr<Registration>& registration) {
  return [weak = std::weak_ptr(registration)](const ItemNews& news) {
    if (const auto alive = weak.lock()) tellNews(alive, news);
  };
}

void PresenterList::tellNews(const std::shared_ptr<Registration>& registration, const ItemNews& news) {
  const FilePresenter::Completion nobodyWaits = [](const std::optional<Error>&) {};
  if (news.deleted) {
    return tell(registration, [nobodyWaits](FilePresenter& presenter) {
      presenter.accommodatePresentedItemDeletionWithCompletionHandler(nobodyWaits);
    });
  }
  if (news.movedTo) {
    tell(registration,
         [place = URL(*news.movedTo)](FilePresenter& presenter) { presenter.presentedItemDidMoveToURL(place); });
  }
  if (news.changed) tell(registration, [](FilePresenter& presenter) { presenter.presentedItemDidChange(); });
  for (const std::string& path : news.deletedInside) {
    tell(registration, [nobodyWaits, place = URL(path)](FilePresenter& presenter) {
      presenter.accommodatePresentedSubitemDeletionAtURLCompletionHandler(place, nobodyWaits);
    });
  }
}

void PresenterList::remove(FilePresenter& presenter) {
  std::shared_ptr<Registration> found;
  {
    const std::lock_guard lock(mutex_);
    const auto at = std::find_if(registrations_.begin(), registrations_.end(), [&](const auto& registration) {
      const std::lock_guard inner(registration->mutex);
      return registration->presenter == &presenter;
    });
    if (at == registrations_.end()) return;
    found = *at;
    registrations_.erase(at);
  }
  // The queue goes after the lock: it may be the last reference.
  std::shared_ptr<OperationQueue> queue;
  ItemWatcher::ItemRef item;
  {
    std::unique_lock lock(found->mutex);
    found->presenter = nullptr;
    queue.swap(found->queue);
    item.swap(found->item);
    found->answered.wait(lock, [&] { return found->questions == 0; });
  }
  if (item) keepForReturn(presenter, item);
}

void PresenterList::keepForReturn(const FilePresenter& presenter, const ItemWatcher::ItemRef& item) {
  watcher_.hold(item);
  const std::string path = watcher_.pathOf(item);
  Left before;
  {
    const std::lock_guard lock(mutex_);
    before = std::exchange(left_, {&presenter, item, path});
  }
  if (before.item) watcher_.unwatch(before.item);
}

std::vector<PresenterList::Shown> PresenterList::shown() {
  std::vector<std::shared_ptr<Registration>> all;
  {
    const std::lock_guard lock(mutex_);
    all = registrations_;
  }
  std::vector<Shown> result;
  for (const std::shared_ptr<Registration>& registration : all) {
    FilePresenter* presenter = nullptr;
    {
      const std::lock_guard lock(registration->mutex);
      if (!registration->presenter) continue;
      presenter = registration->presenter;
      ++registration->questions;
    }
    const std::optional<URL> url = presenter->presentedItemURL();
    ItemWatcher::ItemRef item;
    {
      const std::lock_guard lock(registration->mutex);
      item = registration->item;
      --registration->questions;
    }
    registration->answered.notify_all();
    if (url) result.push_back({registration, presenter, std::move(item), *url});
  }
  return result;
}

void PresenterList::tell(const std::shared_ptr<Registration>& registration, std::function<void(FilePresenter&)> call) {
  std::shared_ptr<OperationQueue> queue;
  {
    const std::lock_guard lock(registration->mutex);
    queue = registration->queue;
  }
  if (!queue) return;
  queue->addOperation([registration, call = std::move(call)] {
    FilePresenter* presenter = nullptr;
    {
      const std::lock_guard lock(registration->mutex);
      presenter = registration->presenter;
    }
    if (presenter) call(*presenter);
  });
}

void PresenterList::itemChanged(const URL& url, const FilePresenter* but) {
  for (const Shown& each : shown()) {
    if (!url.isInside(each.url)) continue;
    if (each.item) watcher_.takeAsKnown(each.item);
    if (each.presenter != but) tell(each.registration, [](FilePresenter& presenter) { presenter.presentedItemDidChange(); });
  }
}

void PresenterList::itemMoved(const URL& from, const URL& to, const FilePresenter* but) {
  for (const Shown& each : shown()) {
    if (!each.url.isInside(from)) continue;
    const URL place(to.path() + each.url.path().substr(from.path().size()), each.url.hasDirectoryPath());
    if (each.item) watcher_.followTo(each.item, place.path());
    if (each.presenter == but) continue;
    tell(each.registration, [place](FilePresenter& presenter) { presenter.presentedItemDidMoveToURL(place); });
  }
}

void PresenterList::itemWillBeDeleted(const URL& url, const FilePresenter* but) {
  const auto answers = std::make_shared<Answers>();
  // One answer for one question, also when the completion is called twice, or never because the presenter left.
  const auto completion = [&answers] {
    {
      const std::lock_guard lock(answers->mutex);
      ++answers->missing;
    }
    return std::shared_ptr<void>(nullptr, [answers](void*) {
      {
        const std::lock_guard lock(answers->mutex);
        --answers->missing;
      }
      answers->changed.notify_all();
    });
  };
  for (const Shown& each : shown()) {
    const bool holdsIt = url.isInside(each.url) && !(url == each.url);
    if (!holdsIt && !each.url.isInside(url)) continue;
    if (each.item && !holdsIt) watcher_.takeDeletionAsTold(each.item);
    if (each.presenter == but) continue;
    auto pending = std::make_shared<std::shared_ptr<void>>(completion());
    tell(each.registration, [pending, holdsIt, url](FilePresenter& presenter) {
      const FilePresenter::Completion done = [pending](const std::optional<Error>&) { pending->reset(); };
      if (holdsIt) {
        presenter.accommodatePresentedSubitemDeletionAtURLCompletionHandler(url, done);
      } else {
        presenter.accommodatePresentedItemDeletionWithCompletionHandler(done);
      }
    });
  }
  constexpr std::chrono::seconds patience(1);
  std::unique_lock lock(answers->mutex);
  answers->changed.wait_for(lock, patience, [&] { return answers->missing == 0; });
}

}  // namespace vaelo
