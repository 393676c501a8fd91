// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <gtk/gtk.h>

#include <string>

namespace vaelo {

/// Puts the file at `path` on the clipboard, so that file managers and others can paste it. Main thread.
void copyFileToClipboard(GdkClipboard* clipboard, const std::string& path);

}  // namespace vaelo
