// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <gtk/gtk.h>

#include <functional>
#include <string>

namespace vaelo {

/// The codes of the host's own entries beside those of ItemAction: the item's tags, and the item as the first of a
/// selection.
inline constexpr int TagsEntry = 1000;
inline constexpr int SelectEntry = 1001;

/// Offers the actions of the item at `path` in a menu that points at `at`, in the coordinates of `over`. `available` has bit
/// n for the code n of ItemAction; the tags are always offered, to select when `selects` says so. What can be popped is
/// peeked at on top of the menu where the window is high enough, and pops when that is pressed. `chosen` gets the code,
/// once, after the menu closed; nothing when the user changes their mind. Main thread.
void showItemActionsMenu(GtkWidget* over, const GdkRectangle& at, const std::string& path, unsigned available, bool selects,
                         std::function<void(int)> chosen);

}  // namespace vaelo
