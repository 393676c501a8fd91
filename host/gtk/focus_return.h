// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <gtk/gtk.h>

namespace vaelo {

/// When the popover, which is about to open, closes, the keyboard goes back to where it is now: the toolkit leaves it with
/// what the popover belongs to, which for a menu of a row is the list's frame, where keys do nothing.
void returnFocusWhenClosed(GtkWidget* popover);

}  // namespace vaelo
