// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <gtk/gtk.h>

#include <future>

#include "host/support/glib_ptr.h"

namespace vaelo {

/// A picture of known size (in pixels) that a thread decodes while its place is laid out. Who draws it first waits for the
/// rest; null is drawn as nothing. Used on the main thread.
GRef<GdkPaintable> makeLatePicture(int width, int height, std::future<GRef<GdkTexture>> coming);

}  // namespace vaelo
