// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <glib.h>

#include <memory>
#include <string>
#include <string_view>
#include <vector>

#include "platform/result.h"

namespace vaelo {

/// The drive's own files (promises, manifests, bookmarks, the account) are small; a larger one is damaged or hostile.
inline constexpr std::size_t SmallFileLimit = 64 * 1024;

enum class FileAccess { Read, Write };

/// The error of FileErrorDomain for an error number of the system, with its text as failure reason and the path.
Error errorFromErrno(int number, const std::string& path, FileAccess access);
/// An error of FileErrorDomain with a reason of our own.
Error fileError(int code, const std::string& path, const std::string& reason);

/// The bytes of a regular file of at most `limit` bytes; a final link is not followed and a pipe doesn't block.
/// Errors: 260, 257, else 256. Any thread.
Result<std::string> readSmallFile(const std::string& path, std::size_t limit = SmallFileLimit);
/// Replaces `path` by a file with these bytes: temporary name in the same folder, flushed, renamed, the folder flushed.
/// With `replacing` false an existing file stays and the error is 516. Any thread.
std::optional<Error> writeSmallFile(const std::string& path, std::string_view bytes, bool replacing = true);

/// Renames a file that is damaged to PATH.damaged-N, so that a new one is not what destroys it. Returns 0 or the error
/// number.
int setFileAside(const std::string& path);

/// Renames a regular file and fails with EEXIST rather than replace one. Returns 0 or the error number.
int renameWithoutReplacing(const std::string& from, const std::string& to);

struct KeyFileFree {
  void operator()(GKeyFile* file) const { g_key_file_free(file); }
};
using KeyFile = std::unique_ptr<GKeyFile, KeyFileFree>;

/// readSmallFile and a parse; 256 for what is no key file.
Result<KeyFile> readKeyFile(const std::string& path);
/// The unescaped value, whose bytes need not be UTF-8; nothing when the key is absent or its escapes are broken.
std::optional<std::string> keyFileBytes(GKeyFile* file, const char* group, const char* key);
/// The values of a list, which semicolons end; nothing when the key is absent. Broken escapes stay as they are.
std::optional<std::vector<std::string>> keyFileList(GKeyFile* file, const char* group, const char* key);
/// "true" and "false"; anything else, and an absent key, is `otherwise`.
bool keyFileBool(GKeyFile* file, const char* group, const char* key, bool otherwise);
/// A file URL; nothing when it is absent, of another scheme or host, relative, wrongly encoded or holds a NUL.
std::optional<URL> keyFileURL(GKeyFile* file, const char* group, const char* key);
std::string keyFileText(GKeyFile* file);

}  // namespace vaelo
