// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <gtk/gtk.h>

namespace vaelo {

/// A label for a text of any length, which can be selected.
GtkWidget* makePopoverText();
/// The label in what scrolls when the text is long, to stand in a popover.
GtkWidget* scrolledPopoverText(GtkWidget* label);

}  // namespace vaelo
