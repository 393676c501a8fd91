// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/files/user_locale.h"

#include <glib.h>

namespace vaelo {

std::string userLocale(const char* purpose) {
  for (const char* variable : {"LC_ALL", purpose, "LANG"}) {
    const char* name = g_getenv(variable);
    const std::string text = name ? name : "";
    if (!text.empty()) return text == "POSIX" || text == "C" || text.starts_with("C.") ? "en_US" : text;
  }
  return "en_US";
}

}  // namespace vaelo
