// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/files/ini_preferences.h"

#include "host/files/key_file_store.h"

namespace vaelo {

namespace {
constexpr const char* Group = "Preferences";
}

IniPreferences::IniPreferences(std::string path, LogSink& log)
    : path_(std::move(path)), log_(log), file_(loadKeyFile(path_)) {}

std::optional<Data> IniPreferences::dataForKey(const std::string& key) {
  char* text = g_key_file_get_string(file_.get(), Group, key.c_str(), nullptr);
  if (!text) return std::nullopt;
  gsize length = 0;
  guchar* bytes = g_base64_decode(text, &length);
  g_free(text);
  Data data(bytes, bytes + length);
  g_free(bytes);
  return data;
}

void IniPreferences::setDataForKey(const std::string& key, const Data& data) {
  const std::string text = takeString(g_base64_encode(data.data(), data.size()));
  g_key_file_set_string(file_.get(), Group, key.c_str(), text.c_str());
  save();
}

void IniPreferences::removeKey(const std::string& key) {
  if (g_key_file_remove_key(file_.get(), Group, key.c_str(), nullptr)) save();
}

void IniPreferences::save() {
  if (const auto error = saveKeyFile(path_, file_.get())) {
    log_.write(LogType::Error, "Preferences can't be saved: " + error->description());
  }
}

}  // namespace vaelo
