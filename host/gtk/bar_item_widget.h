// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <gtk/gtk.h>

#include "platform/ui/bar_button_item.h"

namespace vaelo {

/// Makes the widget of a bar button, which follows the item while both live. Spaces become empty boxes, a label becomes
/// text. A button with a title shows `icon` instead, if given, and keeps its name. The caller sinks the reference. Main
/// thread.
GtkWidget* makeBarItemWidget(const BarButtonItemRef& item, const char* icon = nullptr);

/// The widget of the item that is `root` or below it and shows; null for none. Main thread.
GtkWidget* findBarItemWidget(GtkWidget* root, const BarButtonItem& item);

}  // namespace vaelo
