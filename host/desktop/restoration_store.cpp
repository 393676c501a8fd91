// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/desktop/restoration_store.h"

#include <charconv>

#include "host/files/key_file_store.h"

namespace vaelo {

namespace {

constexpr const char* Urls = "URLs";
constexpr const char* Integers = "Integers";

std::optional<std::int64_t> integer(const std::string& text) {
  std::int64_t number = 0;
  const auto [end, failure] = std::from_chars(text.data(), text.data() + text.size(), number);
  if (failure != std::errc() || end != text.data() + text.size()) return std::nullopt;
  return number;
}

std::optional<URL> url(const std::string& text) {
  const std::optional<URL> plain = URL::fromFileURLString(text);
  return plain && text.back() == '/' ? URL(plain->path(), true) : plain;
}

}  // namespace

std::optional<Error> RestorationStore::save(const Dictionary& values) {
  const KeyFile file(g_key_file_new());
  for (const auto& [key, value] : values) {
    const std::string name = percentEncoded(key);
    if (const URL* kept = value.get<URL>()) {
      g_key_file_set_string(file.get(), Urls, name.c_str(), kept->absoluteString().c_str());
    } else if (value.isNumber()) {
      g_key_file_set_int64(file.get(), Integers, name.c_str(), value.signedValue());
    }
  }
  return saveKeyFile(path_, file.get());
}

Dictionary RestorationStore::load() const {
  const KeyFile file = loadKeyFile(path_);
  Dictionary values;
  for (const char* group : {Urls, Integers}) {
    char** names = g_key_file_get_keys(file.get(), group, nullptr, nullptr);
    for (char** name = names; name && *name; ++name) {
      const std::optional<std::string> key = percentDecoded(*name);
      const std::optional<std::string> text = keyFileBytes(file.get(), group, *name);
      if (!key || !text) continue;
      if (group == Integers) {
        if (const auto number = integer(*text)) values[*key] = Value(*number);
      } else if (const auto kept = url(*text)) {
        values[*key] = Value(*kept);
      }
    }
    g_strfreev(names);
  }
  return values;
}

}  // namespace vaelo
