// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <glib/gi18n.h>

#include <cstdint>
#include <initializer_list>
#include <string>

/// Texts for people. What xgettext finds, and so what must be literals: `_` and `ngettext` translate, `N_` marks what is
/// translated where it is used, `C_` translates what has two meanings, `NP_` marks the singular and the plural of a table.
#define NP_(one, many) one, many

namespace vaelo {

/// Fills "%s", or "%1$s", "%2$s" ..., of a translated format. Not printf: a translation can't ask for more than there is.
std::string filled(const char* format, std::initializer_list<std::string> values);

/// The translation of a text that is known only when the program runs, marked where it was written; empty stays empty.
std::string translated(const std::string& text);

/// A count in the digits and groups of the user's language.
std::string numberText(std::int64_t number);

/// "a, b", as the language separates what is listed.
std::string listedText(const std::string& first, const std::string& second);

/// Two sentences, one after the other.
std::string sentences(const std::string& first, const std::string& second);

}  // namespace vaelo
