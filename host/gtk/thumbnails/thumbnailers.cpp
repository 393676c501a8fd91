// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/gtk/thumbnails/thumbnailers.h"

#include <gio/gio.h>

#include <algorithm>

#include "host/drive/small_file.h"
#include "host/support/glib_ptr.h"

namespace vaelo {

namespace {

constexpr const char* Group = "Thumbnailer Entry";  // not for people

std::vector<std::string> filesIn(const std::string& folder) {
  std::vector<std::string> files;
  GDir* opened = g_dir_open(folder.c_str(), 0, nullptr);
  if (!opened) return files;
  while (const char* name = g_dir_read_name(opened)) {
    if (g_str_has_suffix(name, ".thumbnailer")) files.push_back(folder + "/" + name);
  }
  g_dir_close(opened);
  std::sort(files.begin(), files.end());
  return files;
}

bool isInstalled(const std::string& program) { return !takeString(g_find_program_in_path(program.c_str())).empty(); }

std::vector<std::string> wordsOf(const std::string& line) {
  std::vector<std::string> words;
  char** parsed = nullptr;
  if (g_shell_parse_argv(line.c_str(), nullptr, &parsed, nullptr)) {
    for (char** word = parsed; *word; ++word) words.emplace_back(*word);
    g_strfreev(parsed);
  }
  return words;
}

std::string typeOf(const std::string& fileName) {
  return takeString(g_content_type_guess(fileName.c_str(), nullptr, 0, nullptr));
}

std::string withValues(const std::string& word, const std::map<char, std::string>& values) {
  std::string text;
  for (std::size_t i = 0; i < word.size(); ++i) {
    if (word[i] != '%' || i + 1 == word.size()) {
      text += word[i];
      continue;
    }
    const char mark = word[++i];
    const auto value = values.find(mark);
    if (value != values.end()) text += value->second;
  }
  return text;
}

}  // namespace

Thumbnailers::Thumbnailers(const std::vector<std::string>& folders) {
  for (const std::string& folder : folders) {
    for (const std::string& path : filesIn(folder)) {
      const Result<KeyFile> file = readKeyFile(path);
      if (!file) continue;
      GKeyFile* keys = file.value->get();
      const std::optional<std::string> needed = keyFileBytes(keys, Group, "TryExec");
      const std::vector<std::string> command = wordsOf(keyFileBytes(keys, Group, "Exec").value_or(""));
      if (command.empty() || !isInstalled(command[0]) || (needed && !isInstalled(*needed))) continue;
      const auto types = keyFileList(keys, Group, "MimeType").value_or(std::vector<std::string>());
      for (const std::string& type : types) commands_.emplace(type, command);
    }
  }
}

const Thumbnailers& Thumbnailers::installed() {
  static const Thumbnailers found = [] {
    std::vector<std::string> folders = {std::string(g_get_user_data_dir()) + "/thumbnailers"};
    for (const char* const* folder = g_get_system_data_dirs(); *folder; ++folder) {
      folders.push_back(std::string(*folder) + "/thumbnailers");
    }
    return Thumbnailers(folders);
  }();
  return found;
}

bool Thumbnailers::canShow(const std::string& fileName) const { return commands_.contains(typeOf(fileName)); }

std::optional<std::vector<std::string>> Thumbnailers::commandFor(const std::string& path, const std::string& output,
                                                                 int pixels) const {
  const auto command = commands_.find(typeOf(path.substr(path.rfind('/') + 1)));
  if (command == commands_.end()) return std::nullopt;
  const std::map<char, std::string> values = {{'u', takeString(g_filename_to_uri(path.c_str(), nullptr, nullptr))},
                                              {'i', path},
                                              {'o', output},
                                              {'s', std::to_string(pixels)},
                                              {'%', "%"}};
  std::vector<std::string> words;
  for (const std::string& word : command->second) words.push_back(withValues(word, values));
  return words;
}

}  // namespace vaelo
