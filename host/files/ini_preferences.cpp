// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/files/ini_preferences.h"

#include "host/files/key_file_store.h"
#include "host/support/glib_ptr.h"

namespace vaelo {

namespace {

constexpr const char* Group = "Preferences";

/// A key file's own names may hold no "=", no "[" and no line end.
std::string fileKeyFor(const std::string& key) { return percentEncoded(key); }

bool isBase64(const std::string& text) {
  constexpr const char* letters = "ABCDEFGHIJKLMNOPQRSTUVWXYZabcdefghijklmnopqrstuvwxyz0123456789+/";
  const std::size_t end = text.find_first_not_of(letters);
  return text.size() % 4 == 0 &&
         (end == std::string::npos || (text.size() - end <= 2 && text.find_first_not_of('=', end) == std::string::npos));
}

}  // namespace

IniPreferences::IniPreferences(std::string path, LogSink& log)
    : path_(std::move(path)), log_(log), file_(loadKeyFile(path_)) {}

std::optional<Data> IniPreferences::dataForKey(const std::string& key) {
  const std::optional<std::string> text = keyFileBytes(file_.get(), Group, fileKeyFor(key).c_str());
  if (!text || !isBase64(*text)) return std::nullopt;
  gsize length = 0;
  guchar* bytes = g_base64_decode(text->c_str(), &length);
  Data data(bytes, bytes + length);
  g_free(bytes);
  return data;
}

void IniPreferences::setDataForKey(const std::string& key, const Data& data) {
  const std::string text = takeString(g_base64_encode(data.data(), data.size()));
  g_key_file_set_string(file_.get(), Group, fileKeyFor(key).c_str(), text.c_str());
  save();
}

void IniPreferences::removeKey(const std::string& key) {
  if (g_key_file_remove_key(file_.get(), Group, fileKeyFor(key).c_str(), nullptr)) save();
}

void IniPreferences::save() {
  if (const auto error = saveKeyFile(path_, file_.get())) {
    log_.write(LogType::Error, "Preferences can't be saved: " + error->description());
  }
}

}  // namespace vaelo
