// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <functional>
#include <memory>
#include <optional>

#include "platform/error.h"
#include "platform/queues.h"

namespace vaelo {

/// An object that shows a file or folder and is told what happens to it. All callbacks come on presentedItemOperationQueue.
class FilePresenter {
 public:
  using Completion = std::function<void(std::optional<Error>)>;
  virtual ~FilePresenter() = default;
  /// Asked on any thread.
  virtual std::optional<URL> presentedItemURL() = 0;
  virtual std::shared_ptr<OperationQueue> presentedItemOperationQueue() = 0;
  virtual void presentedItemDidChange() = 0;
  virtual void presentedItemDidMoveToURL(const URL& url) = 0;
  /// The item is about to go; call the completion when ready for it.
  virtual void accommodatePresentedItemDeletionWithCompletionHandler(Completion completion) = 0;
  virtual void accommodatePresentedSubitemDeletionAtURLCompletionHandler(const URL& url, Completion completion) = 0;
};

}  // namespace vaelo
