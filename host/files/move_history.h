// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <sys/types.h>

#include <functional>
#include <memory>
#include <mutex>
#include <optional>
#include <vector>

#include "platform/error.h"
#include "platform/queues.h"
#include "platform/url.h"

namespace vaelo {

/// What this program moved last, so that it can be moved back. What is moved in one go, that is before the main queue turns
/// to something else, is one batch.
class MoveHistory {
 public:
  struct Move {
    URL from;
    URL to;
    dev_t device;  ///< which file or folder it is
    ino_t inode;
  };
  using Batch = std::vector<Move>;
  using Offer = std::function<void(const std::shared_ptr<const Batch>&)>;

  /// `queues` outlives this.
  explicit MoveHistory(Queues& queues) : queues_(queues) {}
  MoveHistory(const MoveHistory&) = delete;
  MoveHistory& operator=(const MoveHistory&) = delete;

  /// An item was moved. Any thread.
  void moved(const URL& from, const URL& to);
  /// Called on the main queue with each batch, but not with what undo() moves. Main thread.
  void setOffer(Offer offer) { offer_ = std::move(offer); }
  /// While held, nothing is offered: the main queue turns to other things in the midst of a move. Main thread.
  void hold(bool held);
  /// Moves the items back, the latest first, by coordinated moves that replace nothing, and goes on after a failure. Answers
  /// what failed; what is no longer the item that was moved stays, with error 512. Blocks. Main thread.
  std::vector<Error> undo(const Batch& batch);

 private:
  void offerPending();

  Queues& queues_;
  Offer offer_;
  std::mutex mutex_;  // guards the two below
  Batch pending_;
  bool undoing_ = false;
  bool held_ = false;                                                                // main thread only
  const std::shared_ptr<MoveHistory*> self_ = std::make_shared<MoveHistory*>(this);  // for blocks that come too late
};

}  // namespace vaelo
