// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <gtk/gtk.h>

#include "platform/ui/view.h"

namespace vaelo {

/// A widget for a view that places its labels and buttons itself: it takes what room there is, lets the view lay out in it,
/// and puts its widgets where the frames say. It follows the view's texts, frames and visibility. The caller owns the
/// floating reference; the widget keeps the view. Main thread.
GtkWidget* makeFramedView(const ViewRef& view);

}  // namespace vaelo
