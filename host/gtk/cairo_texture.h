// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <gtk/gtk.h>

namespace vaelo {

/// What was drawn on a picture of the form ARGB32, which is gone with this. Owned by the caller.
GdkTexture* takeCairoTexture(cairo_surface_t* picture);

}  // namespace vaelo
