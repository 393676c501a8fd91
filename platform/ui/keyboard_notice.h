// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <optional>

#include "platform/notifications.h"
#include "platform/ui/geometry.h"
#include "platform/ui/view_observer.h"

namespace vaelo {

/// What KeyboardWillShowNotification and KeyboardWillHideNotification carry.
struct KeyboardNotice {
  Rect beginFrame;  ///< in the window's coordinates
  Rect endFrame;
  double seconds = 0.25;
  AnimationCurve curve = AnimationCurve::Keyboard;

  Dictionary userInfo() const;
  /// Missing entries read as zero.
  static KeyboardNotice from(const Notification& notification);
};

}  // namespace vaelo
