// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/files/user_locale.h"

#include <glib.h>

namespace vaelo {

namespace {

bool isForNobody(const std::string& locale) { return locale == "POSIX" || locale == "C" || locale.starts_with("C."); }

/// The first of the user's languages, for which gettext looks in every locale but the plain C one.
std::string firstLanguage() {
  const char* list = g_getenv("LANGUAGE");
  const std::string languages = list ? list : "";
  const std::string first = languages.substr(0, languages.find(':'));
  return first.empty() || isForNobody(first) ? "en_US" : first;
}

}  // namespace

std::string userLocale(const char* purpose) {
  for (const char* variable : {"LC_ALL", purpose, "LANG"}) {
    const char* name = g_getenv(variable);
    const std::string text = name ? name : "";
    if (text.empty()) continue;
    if (!isForNobody(text)) return text;
    return text.starts_with("C.") ? firstLanguage() : "en_US";
  }
  return "en_US";
}

}  // namespace vaelo
