// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <chrono>
#include <functional>
#include <memory>
#include <mutex>
#include <vector>

#include "host/files/item_watcher.h"
#include "platform/file_presenter.h"

namespace vaelo {

/// The presenters of this program and what they are told: what other threads do through coordinators, and what other
/// programs do, which the disk tells. Safe from any thread.
///
/// A presenter that comes back for the item that it left for last hears what happened in between, so that a window which was
/// behind others for a while shows what is there.
///
/// Presenters register and leave while they hold locks of their own, which their callbacks take too. So no lock is held
/// while a presenter is called, and remove() does not wait for a callback that runs: a presenter's own queue, which it
/// destroys, does that.
class PresenterList {
 public:
  /// `isBusy` is that of ItemWatcher.
  explicit PresenterList(ItemWatcher::IsBusy isBusy) : watcher_(std::move(isBusy)) {}

  void add(FilePresenter& presenter);
  /// When it returns, no callback begins any more.
  void remove(FilePresenter& presenter);

  // `but` is the presenter on whose behalf the change is made; it is not told.

  /// The item at `url` changed: tells its presenters and those of the folders that hold it.
  void itemChanged(const URL& url, const FilePresenter* but);
  /// Tells the presenters of the item and of what it holds their new places.
  void itemMoved(const URL& from, const URL& to, const FilePresenter* but);
  /// Asks the presenters of the item, of what it holds and of what holds it to let go, and waits until all have answered, or
  /// one second: one that does not answer must not keep the user from deleting.
  void itemWillBeDeleted(const URL& url, const FilePresenter* but);

 private:
  struct Registration;
  struct Shown {
    std::shared_ptr<Registration> registration;
    const FilePresenter* presenter;  // only to be compared: it may leave at any time
    ItemWatcher::ItemRef item;
    URL url;
  };
  std::vector<Shown> shown();
  static void tell(const std::shared_ptr<Registration>& registration, std::function<void(FilePresenter&)> call);

  void keepForReturn(const FilePresenter& presenter, const ItemWatcher::ItemRef& item);
  void watchDisk(const std::shared_ptr<Registration>& registration, const FilePresenter& presenter, const URL& url);
  ItemWatcher::Heard hearing(const std::shared_ptr<Registration>& registration);
  static void tellNews(const std::shared_ptr<Registration>& registration, const ItemNews& news);

  /// The last one that left, and what is followed in its place.
  struct Left {
    const FilePresenter* presenter = nullptr;  // only to be compared: it may be gone
    ItemWatcher::ItemRef item;
    std::string path;
  };
  std::mutex mutex_;  // guards the two below
  std::vector<std::shared_ptr<Registration>> registrations_;
  Left left_;
  ItemWatcher watcher_;  // last, so that its thread ends before what it uses
};

}  // namespace vaelo
