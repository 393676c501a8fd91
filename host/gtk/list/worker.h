// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <functional>
#include <memory>

namespace vaelo {

/// Runs jobs one after another on a thread of its own, which starts with the first job. Main thread.
///
/// A job may hang on a disk that doesn't answer, so the destructor doesn't wait: jobs that have not begun are dropped, and
/// the thread ends by itself. What comes back from a job that was under way is dropped as well.
class Worker {
 public:
  /// Runs on the worker; may use nothing that belongs to the main thread. Returns what is to run on the main thread then.
  using Job = std::function<std::function<void()>()>;

  Worker();
  ~Worker();
  Worker(const Worker&) = delete;
  Worker& operator=(const Worker&) = delete;

  void run(Job job);

 private:
  struct State;
  std::shared_ptr<State> state_;
};

}  // namespace vaelo
