// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/drive/small_file.h"

#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>

#include <algorithm>
#include <cerrno>
#include <cstdio>

namespace vaelo {

namespace {

class Descriptor {
 public:
  explicit Descriptor(int handle) : handle_(handle) {}
  ~Descriptor() {
    if (handle_ >= 0) ::close(handle_);
  }
  Descriptor(const Descriptor&) = delete;
  Descriptor& operator=(const Descriptor&) = delete;
  int get() const { return handle_; }

 private:
  int handle_;
};

bool writeAll(int handle, std::string_view bytes) {
  while (!bytes.empty()) {
    const ssize_t count = ::write(handle, bytes.data(), bytes.size());
    if (count < 0 && errno == EINTR) continue;
    if (count < 0) return false;
    bytes.remove_prefix(static_cast<std::size_t>(count));
  }
  return true;
}

// Without this a crash could lose the name, though the content is on the disk.
bool flushFolder(const std::string& folder) {
  const Descriptor handle(::open(folder.c_str(), O_RDONLY | O_DIRECTORY | O_CLOEXEC));
  return handle.get() >= 0 && ::fsync(handle.get()) == 0;
}

int codeFor(int number, FileAccess access) {
  const bool reading = access == FileAccess::Read;
  switch (number) {
    case ENOENT:
    case ENOTDIR:
      return reading ? FileErrorCode::ReadNoSuchFile : FileErrorCode::NoSuchFile;
    case EACCES:
    case EPERM:
      return reading ? FileErrorCode::ReadNoPermission : FileErrorCode::WriteNoPermission;
    case EEXIST:
      return FileErrorCode::WriteFileExists;
    case ENOSPC:
    case EDQUOT:
      return FileErrorCode::WriteOutOfSpace;
    case EROFS:
      return FileErrorCode::WriteVolumeReadOnly;
    case ENAMETOOLONG:
      return reading ? FileErrorCode::ReadNoSuchFile : FileErrorCode::WriteInvalidFileName;
    default:
      return reading ? FileErrorCode::ReadUnknown : FileErrorCode::WriteUnknown;
  }
}

std::string temporaryPathFor(const std::string& path) {
  char name[48];
  std::snprintf(name, sizeof name, ".vaelo-%08x%08x.tmp", g_random_int(), g_random_int());
  return path.substr(0, path.rfind('/') + 1) + name;
}

std::optional<std::string> rawValue(GKeyFile* file, const char* group, const char* key) {
  gchar* raw = g_key_file_get_value(file, group, key, nullptr);
  if (!raw) return std::nullopt;
  std::string value(raw);
  g_free(raw);
  return value;
}

// The library's own unescaping refuses what is not UTF-8, which names need not be.
std::optional<std::string> unescaped(const std::string& escaped) {
  std::string value;
  for (std::size_t i = 0; i < escaped.size(); ++i) {
    if (escaped[i] != '\\') {
      value.push_back(escaped[i]);
      continue;
    }
    if (++i == escaped.size()) return std::nullopt;
    constexpr std::string_view letters = "sntr\\;";
    const std::size_t at = letters.find(escaped[i]);
    if (at == std::string_view::npos) return std::nullopt;
    value.push_back(" \n\t\r\\;"[at]);
  }
  return value;
}

}  // namespace

Error errorFromErrno(int number, const std::string& path, FileAccess access) {
  return fileError(codeFor(number, access), path, g_strerror(number));
}

Error fileError(int code, const std::string& path, const std::string& reason) {
  Error error;
  error.domain = FileErrorDomain;
  error.code = code;
  error.userInfo[FilePathErrorKey] = path;
  error.localizedFailureReason = reason;
  return error;
}

Result<std::string> readSmallFile(const std::string& path, std::size_t limit) {
  const Descriptor handle(::open(path.c_str(), O_RDONLY | O_NOFOLLOW | O_NONBLOCK | O_NOCTTY | O_CLOEXEC));
  if (handle.get() < 0) return errorFromErrno(errno, path, FileAccess::Read);
  struct stat status = {};
  if (::fstat(handle.get(), &status) != 0) return errorFromErrno(errno, path, FileAccess::Read);
  if (!S_ISREG(status.st_mode)) return fileError(FileErrorCode::ReadUnknown, path, "not a regular file");
  // One more than there should be: a file that grows meanwhile is read to its end, or to the limit.
  std::string bytes(std::min(static_cast<std::size_t>(std::max<off_t>(status.st_size, 0)), limit) + 1, '\0');
  std::size_t length = 0;
  for (;;) {
    if (length == bytes.size()) {
      if (length > limit) break;
      bytes.resize(limit + 1);
    }
    const ssize_t count = ::read(handle.get(), bytes.data() + length, bytes.size() - length);
    if (count < 0 && errno == EINTR) continue;
    if (count < 0) return errorFromErrno(errno, path, FileAccess::Read);
    if (count == 0) break;
    length += static_cast<std::size_t>(count);
  }
  if (length > limit) return fileError(FileErrorCode::ReadUnknown, path, "the file is too large");
  bytes.resize(length);
  return bytes;
}

std::optional<Error> writeSmallFile(const std::string& path, std::string_view bytes, bool replacing) {
  const std::string temporary = temporaryPathFor(path);
  int failed = 0;
  {
    const Descriptor handle(::open(temporary.c_str(), O_WRONLY | O_CREAT | O_EXCL | O_NOFOLLOW | O_CLOEXEC, 0644));
    if (handle.get() < 0) return errorFromErrno(errno, path, FileAccess::Write);
    if (!writeAll(handle.get(), bytes) || ::fsync(handle.get()) != 0) failed = errno;
  }
  if (failed == 0) {
    if (!replacing) {
      failed = renameWithoutReplacing(temporary, path);
    } else if (::rename(temporary.c_str(), path.c_str()) != 0) {
      failed = errno;
    }
  }
  if (failed != 0) {
    ::unlink(temporary.c_str());
    return errorFromErrno(failed, path, FileAccess::Write);
  }
  if (!flushFolder(path.substr(0, path.rfind('/') + 1))) return errorFromErrno(errno, path, FileAccess::Write);
  return std::nullopt;
}

int setFileAside(const std::string& path) {
  int status = EEXIST;
  for (int number = 1; status == EEXIST; ++number) {
    status = renameWithoutReplacing(path, path + ".damaged-" + std::to_string(number));
  }
  return status;
}

int renameWithoutReplacing(const std::string& from, const std::string& to) {
  if (::renameat2(AT_FDCWD, from.c_str(), AT_FDCWD, to.c_str(), RENAME_NOREPLACE) == 0) return 0;
  if (errno != EINVAL) return errno;
  // Network file systems don't know the flag; a second name that is there fails as well.
  if (::link(from.c_str(), to.c_str()) != 0) return errno;
  return ::unlink(from.c_str()) == 0 ? 0 : errno;
}

Result<KeyFile> readKeyFile(const std::string& path) {
  Result<std::string> bytes = readSmallFile(path);
  if (!bytes) return *bytes.error;
  KeyFile file(g_key_file_new());
  if (!g_key_file_load_from_data(file.get(), bytes.value->data(), bytes.value->size(), G_KEY_FILE_KEEP_TRANSLATIONS,
                                 nullptr)) {
    return fileError(FileErrorCode::ReadUnknown, path, "the file is damaged");
  }
  return file;
}

std::optional<std::string> keyFileBytes(GKeyFile* file, const char* group, const char* key) {
  const std::optional<std::string> escaped = rawValue(file, group, key);
  return escaped ? unescaped(*escaped) : std::nullopt;
}

std::optional<std::vector<std::string>> keyFileList(GKeyFile* file, const char* group, const char* key) {
  const std::optional<std::string> escaped = rawValue(file, group, key);
  if (!escaped) return std::nullopt;
  std::vector<std::string> items;
  std::string item;
  const auto finish = [&] {
    if (!item.empty()) items.push_back(unescaped(item).value_or(item));
    item.clear();
  };
  for (std::size_t i = 0; i < escaped->size(); ++i) {
    if ((*escaped)[i] == ';') {
      finish();
      continue;
    }
    item.push_back((*escaped)[i]);
    if ((*escaped)[i] == '\\' && i + 1 < escaped->size()) item.push_back((*escaped)[++i]);
  }
  finish();
  return items;
}

bool keyFileBool(GKeyFile* file, const char* group, const char* key, bool otherwise) {
  const std::optional<std::string> text = keyFileBytes(file, group, key);
  if (text == "true") return true;
  if (text == "false") return false;
  return otherwise;
}

std::optional<URL> keyFileURL(GKeyFile* file, const char* group, const char* key) {
  const std::optional<std::string> text = keyFileBytes(file, group, key);
  return text ? URL::fromFileURLString(*text) : std::nullopt;
}

std::string keyFileText(GKeyFile* file) {
  gsize length = 0;
  gchar* data = g_key_file_to_data(file, &length, nullptr);
  std::string text(data, length);
  g_free(data);
  return text;
}

}  // namespace vaelo
