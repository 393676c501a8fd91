// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/files/system_error.h"

#include <glib.h>

#include <cerrno>

namespace vaelo {

namespace {

struct Kind {
  int code;
  const char* words;
};

Kind kindOf(int number, bool writing) {
  switch (number) {
    case ENOENT:
    case ENOTDIR: return {FileErrorCode::NoSuchFile, "The file “%s” doesn’t exist any more."};
    case EACCES:
    case EPERM:
      return {writing ? FileErrorCode::WriteNoPermission : FileErrorCode::ReadNoPermission,
              "You don’t have permission to use “%s”."};
    case EEXIST:
    case ENOTEMPTY: return {FileErrorCode::WriteFileExists, "An item named “%s” already exists."};
    case ENAMETOOLONG: return {FileErrorCode::WriteInvalidFileName, "The name “%s” is too long."};
    case ENOSPC:
    case EDQUOT: return {FileErrorCode::WriteOutOfSpace, "There is not enough space for “%s”. Delete something and try again."};
    case EROFS: return {FileErrorCode::WriteVolumeReadOnly, "“%s” is on a disk that can only be read."};
    case ELOOP: return {FileErrorCode::ReadUnknown, "The links of “%s” run in a circle."};
    default: return {writing ? FileErrorCode::WriteUnknown : FileErrorCode::ReadUnknown, "“%s” can’t be used."};
  }
}

}  // namespace

Error errorFromErrno(int number, const std::string& path, bool writing) {
  const Kind kind = kindOf(number, writing);
  char* name = g_filename_display_basename(path.c_str());
  // The words hold one %s each.
#pragma GCC diagnostic push
#pragma GCC diagnostic ignored "-Wformat-nonliteral"
  char* text = g_strdup_printf(kind.words, name);
#pragma GCC diagnostic pop
  Error error{FileErrorDomain, kind.code, {{FilePathErrorKey, Value(path)}}, text, g_strerror(number)};
  g_free(text);
  g_free(name);
  return error;
}

}  // namespace vaelo
