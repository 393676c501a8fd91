// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <gtksourceview/gtksource.h>

#include "host/support/glib_ptr.h"

namespace vaelo {

// The text library writes down each buffer that was ever made and never forgets it, so buffers are used again. Main thread.

/// An empty buffer that keeps no history and marks no brackets.
GRef<GtkSourceBuffer> takeTextBuffer();

/// Empties a buffer that nobody looks at any more in slices of some milliseconds, whenever the main loop has nothing better
/// to do, and keeps it for the next document: all at once that takes long for a long text, above all when it is highlighted.
/// Tags that have names are taken for the document's own, and go.
void endTextBuffer(GRef<GtkSourceBuffer> buffer);

/// A view, which is floating. Until it gets a buffer it shows an empty one, which views share and nobody may write into.
GtkWidget* makeTextWidget();

}  // namespace vaelo
