// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <gtk/gtk.h>

#include <string>

namespace vaelo {

/// A line below a document that tells of it what can't be seen. Hidden while it is empty.
GtkWidget* makePreviewNote();
void setPreviewNote(GtkWidget* note, const std::string& text);

}  // namespace vaelo
