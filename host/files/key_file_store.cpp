// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/files/key_file_store.h"

#include <glib/gstdio.h>

#include <cerrno>

#include "host/files/system_error.h"

namespace vaelo {

GKeyFilePtr loadKeyFile(const std::string& path) {
  GKeyFilePtr file(g_key_file_new());
  GError* error = nullptr;
  if (!g_key_file_load_from_file(file.get(), path.c_str(), G_KEY_FILE_NONE, &error)) {
    const GErrorPtr owned(error);
    if (!g_error_matches(error, G_FILE_ERROR, G_FILE_ERROR_NOENT)) {
      g_rename(path.c_str(), (path + ".damaged").c_str());
      file.reset(g_key_file_new());
    }
  }
  return file;
}

std::optional<Error> saveKeyFile(const std::string& path, GKeyFile* file) {
  const std::string folder = takeString(g_path_get_dirname(path.c_str()));
  if (g_mkdir_with_parents(folder.c_str(), 0700) != 0) return errorFromErrno(errno, folder, true);
  gsize length = 0;
  const std::string text = takeString(g_key_file_to_data(file, &length, nullptr));
  GError* error = nullptr;
  constexpr auto flags = static_cast<GFileSetContentsFlags>(G_FILE_SET_CONTENTS_CONSISTENT | G_FILE_SET_CONTENTS_DURABLE);
  if (g_file_set_contents_full(path.c_str(), text.data(), static_cast<gssize>(length), flags, 0600, &error)) return {};
  const GErrorPtr owned(error);
  const bool full = g_error_matches(error, G_FILE_ERROR, G_FILE_ERROR_NOSPC);
  return errorFromErrno(full ? ENOSPC : EIO, path, true);
}

}  // namespace vaelo
