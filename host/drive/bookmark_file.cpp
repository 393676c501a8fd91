// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/drive/bookmark_file.h"

#include "host/drive/small_file.h"

namespace vaelo {

namespace {
constexpr std::string_view bookmarkSuffix = ".vaelobookmark";
constexpr const char* bookmarkGroup = "Bookmark";
}  // namespace

bool isBookmarkName(std::string_view name) { return name.size() > bookmarkSuffix.size() && name.ends_with(bookmarkSuffix); }

Result<URL> readBookmarkFile(const std::string& path) {
  const Result<KeyFile> file = readKeyFile(path);
  if (!file) return *file.error;
  if (const std::optional<URL> url = keyFileURL(file.value->get(), bookmarkGroup, "URL")) return *url;
  return fileError(FileErrorCode::ReadUnknown, path, "the bookmark does not name a file");
}

std::optional<Error> writeBookmarkFile(const std::string& path, const URL& target) {
  const KeyFile file(g_key_file_new());
  g_key_file_set_string(file.get(), bookmarkGroup, "URL", target.absoluteString().c_str());
  return writeSmallFile(path, keyFileText(file.get()));
}

}  // namespace vaelo
