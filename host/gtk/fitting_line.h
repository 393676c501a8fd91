// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <gtk/gtk.h>

namespace vaelo {

/// Lays the pictures and labels of a box out in one line from its beginning, each as wide as it wants to be. Where not all
/// of them fit, what comes last is left out, as in a text that is too long for its line: the last label that shows ends in
/// an ellipsis, or the box's last child, which is otherwise not seen, follows it. A picture shows only with some of the
/// label behind it. The caller takes the reference.
GtkLayoutManager* makeFittingLineLayout();

}  // namespace vaelo
