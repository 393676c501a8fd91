// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <chrono>
#include <functional>
#include <memory>
#include <mutex>
#include <vector>

#include "platform/file_presenter.h"

namespace vaelo {

/// The presenters of this program and what they are told. Safe from any thread.
///
/// Presenters register and leave while they hold locks of their own, which their callbacks take too. So no lock is held
/// while a presenter is called, and remove() does not wait for a callback that runs: a presenter's own queue, which it
/// destroys, does that.
class PresenterList {
 public:
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
    URL url;
  };
  std::vector<Shown> shown(const FilePresenter* but);
  static void tell(const std::shared_ptr<Registration>& registration, std::function<void(FilePresenter&)> call);

  std::mutex mutex_;  // guards registrations_
  std::vector<std::shared_ptr<Registration>> registrations_;
};

}  // namespace vaelo
