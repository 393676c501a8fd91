// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/gtk/preview/text_languages.h"

#include <string>
#include <vector>

#include "host/support/own_folder.h"

namespace vaelo {

// The library looks for the schema of grammars where it looks for these, and takes the first.
GtkSourceLanguageManager* textLanguages() {
  static GtkSourceLanguageManager* const shared = [] {
    GtkSourceLanguageManager* languages = gtk_source_language_manager_new();
    const std::string own = ownFolder("grammars", "share/vaelo-drive/grammars", "language2.rng");
    std::vector<const char*> folders = {own.c_str()};
    for (const char* const* folder = gtk_source_language_manager_get_search_path(languages); *folder; ++folder) {
      folders.push_back(*folder);
    }
    folders.push_back(nullptr);
    if (!own.empty()) gtk_source_language_manager_set_search_path(languages, folders.data());
    return languages;
  }();
  return shared;
}

}  // namespace vaelo
