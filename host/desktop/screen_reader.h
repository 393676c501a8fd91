// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <gio/gio.h>

#include <functional>

#include "host/support/glib_ptr.h"

namespace vaelo {

/// Whether somebody listens: what only a screen reader needs, and costs work, is done when one is in use. Main thread.
class ScreenReader {
 public:
  /// `changed` is called when one begins or ends, and when the desktop's first answer is that there is one.
  explicit ScreenReader(std::function<void()> changed);
  ~ScreenReader();
  ScreenReader(const ScreenReader&) = delete;
  ScreenReader& operator=(const ScreenReader&) = delete;

  /// False until the desktop has answered.
  bool isOn() const { return on_; }

 private:
  void look();

  std::function<void()> changed_;
  bool on_ = false;
  GRef<GCancellable> asking_;
  GRef<GDBusProxy> status_;
};

}  // namespace vaelo
