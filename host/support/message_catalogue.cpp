// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/support/message_catalogue.h"

#include <glib.h>
#include <libintl.h>
#include <unicode/uloc.h>

#include <clocale>
#include <string_view>

#include "host/support/own_folder.h"

namespace vaelo {

namespace {

constexpr const char* Domain = "vaelo-drive";

std::string catalogueFolder() {
  const std::string own = ownFolder("locale", "share/locale", std::string("en/LC_MESSAGES/") + Domain + ".mo");
  return own.empty() ? VAELO_LOCALE_DIR : own;
}

bool isSet(const char* variable) {
  const char* value = g_getenv(variable);
  return value && *value;
}

// Of "de_DE.UTF-8@euro" what gettext looks for: "de_DE@euro".
std::string withoutCodeset(std::string name) {
  const std::size_t dot = name.find('.');
  if (dot == std::string::npos) return name;
  const std::size_t modifier = name.find('@', dot);
  return name.substr(0, dot) + (modifier == std::string::npos ? "" : name.substr(modifier));
}

/// A locale need not be installed for its language to be spoken: containers and small systems often have none.
void doWithoutInstalledLocale() {
  for (const int category : {LC_CTYPE, LC_COLLATE, LC_MONETARY, LC_NUMERIC, LC_TIME, LC_MESSAGES}) {
    if (!std::setlocale(category, "")) std::setlocale(category, "C.UTF-8");
  }
  if (isSet("LANGUAGE")) return;
  for (const char* variable : {"LC_ALL", "LC_MESSAGES", "LANG"}) {
    if (!isSet(variable)) continue;
    g_setenv("LANGUAGE", withoutCodeset(g_getenv(variable)).c_str(), TRUE);
    return;
  }
}

}  // namespace

void useMessageCatalogue() {
  if (!std::setlocale(LC_ALL, "")) doWithoutInstalledLocale();
  bindtextdomain(Domain, catalogueFolder().c_str());
  bind_textdomain_codeset(Domain, "UTF-8");
  textdomain(Domain);
}

std::string messageLocale() {
  // Which of the user's languages it has become only the catalogue itself knows.
  constexpr std::string_view field = "\nLanguage: ";
  const std::string header = std::string("\n") + gettext("");
  const std::size_t at = header.find(field);
  if (at == std::string::npos) return "en";
  const std::size_t start = at + field.size();
  return header.substr(start, header.find('\n', start) - start);
}

bool messagesAreRightToLeft() { return uloc_isRightToLeft(messageLocale().c_str()); }

}  // namespace vaelo
