// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/files/move_history.h"

#include <sys/stat.h>

#include <cerrno>
#include <utility>

#include "host/drive/promise_file.h"
#include "host/files/system_error.h"
#include "items/file_utils.h"

namespace vaelo {

namespace {

/// Of an item that is not downloaded, its promise.
std::optional<struct stat> statusOf(const URL& item) {
  struct stat info {};
  if (lstat(item.path().c_str(), &info) == 0) return info;
  const std::optional<std::string> physical = physicalPathOf(item.path());
  if (!physical || lstat(physical->c_str(), &info) != 0) return std::nullopt;
  return info;
}

}  // namespace

void MoveHistory::moved(const URL& from, const URL& to) {
  const std::optional<struct stat> info = statusOf(to);
  const std::lock_guard lock(mutex_);
  if (undoing_ || !info) return;
  pending_.push_back({from, to, info->st_dev, info->st_ino});
  if (pending_.size() > 1) return;
  queues_.main().async([weak = std::weak_ptr(self_)] {
    if (const auto self = weak.lock()) (*self)->offerPending();
  });
}

void MoveHistory::hold(bool held) {
  held_ = held;
  offerPending();
}

void MoveHistory::offerPending() {
  if (held_) return;
  auto batch = std::make_shared<Batch>();
  {
    const std::lock_guard lock(mutex_);
    batch->swap(pending_);
  }
  if (offer_ && !batch->empty()) offer_(batch);
}

std::vector<Error> MoveHistory::undo(const Batch& batch) {
  const auto setUndoing = [this](bool undoing) {
    const std::lock_guard lock(mutex_);
    undoing_ = undoing;
  };
  setUndoing(true);
  std::vector<Error> errors;
  for (auto move = batch.rbegin(); move != batch.rend(); ++move) {
    const std::optional<struct stat> now = statusOf(move->to);
    std::optional<Error> error;
    if (!now) {
      error = describedError(ENOENT, move->to.path(), FileAccess::Write);
    } else if (now->st_dev != move->device || now->st_ino != move->inode) {
      error = describedError(EINVAL, move->to.path(), FileAccess::Write);
    } else {
      error = FileUtils::moveTo(move->to, move->from);
    }
    if (error) errors.push_back(std::move(*error));
  }
  setUndoing(false);
  return errors;
}

}  // namespace vaelo
