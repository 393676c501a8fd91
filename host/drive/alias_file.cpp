// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/drive/alias_file.h"

#include "host/drive/small_file.h"

namespace vaelo {

namespace {
constexpr std::string_view aliasSuffix = ".desktop";
}  // namespace

bool isAliasName(std::string_view name) { return name.size() > aliasSuffix.size() && name.ends_with(aliasSuffix); }

Result<URL> readAliasFile(const std::string& path) {
  const Result<KeyFile> file = readKeyFile(path);
  if (!file) return *file.error;
  GKeyFile* keys = file.value->get();
  if (keyFileBytes(keys, G_KEY_FILE_DESKTOP_GROUP, G_KEY_FILE_DESKTOP_KEY_TYPE) != G_KEY_FILE_DESKTOP_TYPE_LINK) {
    return fileError(FileErrorCode::ReadUnknown, path, "the file is no alias");
  }
  if (const std::optional<URL> url = keyFileURL(keys, G_KEY_FILE_DESKTOP_GROUP, G_KEY_FILE_DESKTOP_KEY_URL)) return *url;
  return fileError(FileErrorCode::ReadUnknown, path, "the alias does not name a file");
}

}  // namespace vaelo
