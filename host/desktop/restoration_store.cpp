// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/desktop/restoration_store.h"

#include "host/files/key_file_store.h"

namespace vaelo {

namespace {
constexpr const char* Urls = "URLs";
constexpr const char* Integers = "Integers";
}  // namespace

void RestorationStore::save(const Dictionary& values) {
  const GKeyFilePtr file(g_key_file_new());
  for (const auto& [key, value] : values) {
    if (const URL* url = value.get<URL>()) {
      g_key_file_set_string(file.get(), Urls, key.c_str(), url->absoluteString().c_str());
    } else if (value.isNumber()) {
      g_key_file_set_int64(file.get(), Integers, key.c_str(), value.signedValue());
    }
  }
  // State that can't be kept costs the user one tap after the next start; that is no reason for an alert.
  saveKeyFile(path_, file.get());
}

Dictionary RestorationStore::load() const {
  const GKeyFilePtr file = loadKeyFile(path_);
  Dictionary values;
  for (const char* group : {Urls, Integers}) {
    char** keys = g_key_file_get_keys(file.get(), group, nullptr, nullptr);
    for (char** key = keys; key && *key; ++key) {
      if (group == Integers) {
        values[*key] = Value(std::int64_t{g_key_file_get_int64(file.get(), group, *key, nullptr)});
      } else if (const auto url = URL::fromFileURLString(takeString(g_key_file_get_string(file.get(), group, *key, nullptr)))) {
        values[*key] = Value(*url);
      }
    }
    g_strfreev(keys);
  }
  return values;
}

}  // namespace vaelo
