// SPDX-License-Identifier: GPL-3.0-or-later
// How long the main loop is held, for the programs that measure it.
#pragma once

#include <glib.h>

#include <algorithm>
#include <ctime>
#include <vector>

namespace vaelo::bench {

/// How long the main loop's turns take, between two times that it waits for events: what the processor did for them, so that
/// it doesn't matter what else the machine does. The main loop waits for no disk and no other process, which would count
/// too.
class Turns {
 public:
  static void watch() {
    waitForEvents() = g_main_context_get_poll_func(nullptr);
    g_main_context_set_poll_func(nullptr, poll);
  }
  static void forget() { all().clear(); }
  static double longest() { return all().empty() ? 0 : *std::max_element(all().begin(), all().end()); }
  static std::size_t count() { return all().size(); }

 private:
  static GPollFunc& waitForEvents() {
    static GPollFunc function = nullptr;
    return function;
  }
  static std::vector<double>& all() {
    static std::vector<double> turns;
    return turns;
  }
  static int poll(GPollFD* fds, guint count, int timeout) {
    static double begun = 0;
    if (begun > 0) all().push_back(worked() - begun);
    const int result = waitForEvents()(fds, count, timeout);
    begun = worked();
    return result;
  }
  static double worked() {
    timespec time = {};
    ::clock_gettime(CLOCK_THREAD_CPUTIME_ID, &time);
    return static_cast<double>(time.tv_sec) * 1e3 + static_cast<double>(time.tv_nsec) / 1e6;
  }
};

}  // namespace vaelo::bench
