// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <gtk/gtk.h>

#include <cstddef>

#include "host/support/glib_ptr.h"
#include "host/support/unique_fd.h"

namespace vaelo {

/// The content of a file that the decoder sent, mapped, not copied; nothing when it is shorter than `atLeast` bytes or could
/// still be cut short. To be released with g_bytes_unref. Any thread.
GBytes* takeSharedBytes(UniqueFd file, std::size_t atLeast);
/// A picture of premultiplied BGRA pixels (CAIRO_FORMAT_ARGB32), `width` x `height`, rows `width * 4` bytes apart; null when
/// the file isn't one. Any thread.
GRef<GdkTexture> takeTexture(UniqueFd file, int width, int height);

}  // namespace vaelo
