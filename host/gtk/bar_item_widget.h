// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <gtk/gtk.h>

#include "platform/ui/bar_button_item.h"

namespace vaelo {

/// Makes the widget of a bar button, which follows the item while both live. Spaces become empty boxes, a label becomes
/// text. The caller sinks the reference. Main thread.
GtkWidget* makeBarItemWidget(const BarButtonItemRef& item);

}  // namespace vaelo
