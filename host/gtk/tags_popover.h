// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <gtk/gtk.h>

#include <functional>

#include "platform/url.h"

namespace vaelo {

class DriveSyncedStore;

/// Shows the tags of an item, or of what it leads to, in a popover that points at `at`, in the coordinates of `over`: those
/// that the user knows, with their colours, to be put on and taken off, and a field for a new one, which becomes one of the
/// user's `tags`. What is chosen is written at once, by a worker, and `changed`, unless it is empty, is called after each
/// change. It shows when the item's tags were read. `tags` outlives it. Main thread.
void showTagsPopover(GtkWidget* over, const GdkRectangle& at, const URL& item, DriveSyncedStore& tags,
                     std::function<void()> changed = {});

}  // namespace vaelo
