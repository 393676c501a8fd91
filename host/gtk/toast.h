// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <adwaita.h>

#include <functional>
#include <string>

namespace vaelo {

/// A toast whose text is shown whole on a phone, and a button beside it when one is named.
AdwToast* makeToast(const std::string& text, const char* button = nullptr);

/// What toasts may take of the area that they lie over.
struct ToastRoom {
  int width = 360;
  int below = 0;  ///< the height of the bar that they stand above
};

/// Makes those that makeToast() made, and `toasts` shows, fit into what `room` answers: each when it comes, and the one that
/// shows when fitToasts() says that the room has changed. `room` is asked as long as `toasts` lives.
void setToastRoom(AdwToastOverlay* toasts, std::function<ToastRoom()> room);
void fitToasts(AdwToastOverlay* toasts);

}  // namespace vaelo
