// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <string>

namespace vaelo {

/// Lets texts appear in the user's language, as LANGUAGE, LC_ALL, LC_MESSAGES and LANG say. Before anything is shown, on the
/// one thread that there is then, since it sets the process's locale and, where the user's own is not installed, LANGUAGE.
void useMessageCatalogue();

/// The language in which texts appear, as "de" or "pt_BR"; "en" where there is no translation.
std::string messageLocale();

/// Whether that language is written from right to left.
bool messagesAreRightToLeft();

}  // namespace vaelo
