// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/files/key_file_store.h"

#include <cerrno>

#include "host/files/system_error.h"
#include "host/support/glib_ptr.h"

namespace vaelo {

KeyFile loadKeyFile(const std::string& path) {
  Result<KeyFile> file = readKeyFile(path);
  if (file) return std::move(*file.value);
  if (file.error->code != FileErrorCode::ReadNoSuchFile) setFileAside(path);
  return KeyFile(g_key_file_new());
}

std::optional<Error> saveKeyFile(const std::string& path, GKeyFile* file) {
  const std::string folder = takeString(g_path_get_dirname(path.c_str()));
  if (g_mkdir_with_parents(folder.c_str(), 0700) != 0) return describedError(errno, folder, FileAccess::Write);
  const std::string text = keyFileText(file);
  if (text.size() > SmallFileLimit) return fileError(FileErrorCode::WriteUnknown, path, "more than is read back");
  return writeSmallFile(path, text);
}

}  // namespace vaelo
