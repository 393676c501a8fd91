// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <gtk/gtk.h>

namespace vaelo {

/// Gives a popover its parent, which takes its reference, until the popover has closed, or the parent goes: a parent that is
/// gone would be left by a popover that closes late. Main thread.
void setPopoverParent(GtkWidget* popover, GtkWidget* parent);

}  // namespace vaelo
