// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/gtk/preview/text_languages.h"

#include <filesystem>
#include <string>
#include <vector>

#include "host/support/glib_ptr.h"

namespace vaelo {

namespace {

// Below the folder of the application where it is built, one up for its tests; where it is installed, wherever that was
// moved to. Empty when it is nowhere.
std::string grammarFolder() {
  const std::filesystem::path program =
      std::filesystem::path(takeString(g_file_read_link("/proc/self/exe", nullptr))).parent_path();
  const std::filesystem::path above = program.parent_path();
  for (const std::filesystem::path& folder :
       {program / "grammars", above / "grammars", above / "share" / "vaelo-drive" / "grammars"}) {
    if (g_file_test((folder / "language2.rng").c_str(), G_FILE_TEST_IS_REGULAR)) return folder;
  }
  return "";
}

}  // namespace

// The library looks for the schema of grammars where it looks for these, and takes the first.
GtkSourceLanguageManager* textLanguages() {
  static GtkSourceLanguageManager* const shared = [] {
    GtkSourceLanguageManager* languages = gtk_source_language_manager_new();
    const std::string own = grammarFolder();
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
