// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <gtk/gtk.h>

#include "platform/notifications.h"

namespace vaelo {

/// Tells screens of the on-screen keyboard. The toolkit doesn't know its area; the shells of phones make the window lower
/// while it is up. So a window that gets much lower while a text is edited has a keyboard below it until it is as high
/// again, or another width. Main thread.
class KeyboardArea {
 public:
  /// Both outlive it.
  KeyboardArea(GtkWindow* window, NotificationCenter& notifications) : window_(window), notifications_(notifications) {}
  /// The window has this size now, in points. Answers the height that it has or would have without a keyboard: what comes
  /// and goes with that is no other size to screens, which would begin anew with what is being typed.
  int windowResized(int width, int height);

 private:
  bool textIsEdited() const;
  void tell(const char* name, int height) const;

  GtkWindow* window_;
  NotificationCenter& notifications_;
  int width_ = 0;
  int height_ = 0;   // at the last call
  int without_ = 0;  // the height without the keyboard
  bool shown_ = false;
};

}  // namespace vaelo
