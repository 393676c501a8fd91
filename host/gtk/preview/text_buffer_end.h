// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <gtksourceview/gtksource.h>

#include "host/support/glib_ptr.h"

namespace vaelo {

/// Empties a buffer that nobody looks at any more in slices of some milliseconds, whenever the main loop has nothing better
/// to do, and lets it go: all at once that takes long for a long text, above all when it is highlighted. Main thread.
void endTextBuffer(GRef<GtkSourceBuffer> buffer);

}  // namespace vaelo
