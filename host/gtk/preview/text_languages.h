// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <gtksourceview/gtksource.h>

namespace vaelo {

/// The languages that source text is in; the same at each call. The first one that a language is asked of takes some
/// milliseconds, and each language when it is used. Main thread.
GtkSourceLanguageManager* textLanguages();

}  // namespace vaelo
