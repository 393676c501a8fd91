// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <gtk/gtk.h>

#include <string>

namespace vaelo {

/// The height that a peek takes in a menu.
inline constexpr int PeekRoom = 136;

/// A look at an item without opening it: its picture, the beginning of its text, or the first names of a folder; else its
/// icon. What is read is read by a thread and shows when it is there; the size is the same from the start. Pressing it
/// activates `action` with `target` and closes the popover that it stands in. Floating. Main thread.
GtkWidget* makeItemPeek(const std::string& path, const char* action, int target);

}  // namespace vaelo
