// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/gtk/keyboard_area.h"

#include <utility>

#include "platform/ui/keyboard_notice.h"

namespace vaelo {

namespace {

/// No keyboard for fingers is lower.
constexpr int LeastHeight = 120;

}  // namespace

int KeyboardArea::windowResized(int width, int height) {
  const int before = std::exchange(height_, height);
  const bool turned = std::exchange(width_, width) != width;
  if (shown_) {
    if (!turned && height < without_ && (height == before || textIsEdited())) return without_;
    shown_ = false;
    tell(KeyboardWillHideNotification, without_ - before);
  } else if (!turned && before - height >= LeastHeight && textIsEdited()) {
    shown_ = true;
    without_ = before;
    tell(KeyboardWillShowNotification, before - height);
    return without_;
  }
  return height;
}

bool KeyboardArea::textIsEdited() const {
  GtkWidget* focus = gtk_window_get_focus(window_);
  return focus && (GTK_IS_EDITABLE(focus) || GTK_IS_TEXT(focus));
}

void KeyboardArea::tell(const char* name, int height) const {
  KeyboardNotice notice;
  notice.beginFrame = {0, static_cast<double>(without_ - height), static_cast<double>(width_), static_cast<double>(height)};
  notice.endFrame = notice.beginFrame;
  notifications_.post({name, notice.userInfo()});
}

}  // namespace vaelo
