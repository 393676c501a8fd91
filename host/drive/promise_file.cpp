// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/drive/promise_file.h"

#include <sys/stat.h>

#include <charconv>
#include <cmath>
#include <cstdio>

#include "host/drive/small_file.h"
#include "platform/resource_values.h"

namespace vaelo {

namespace {

constexpr std::string_view shortSuffix = ".vlopromise";
constexpr std::string_view longSuffix = ".vlopromise-long";
constexpr std::size_t nameLimit = 255;  // bytes in a name on every file system that we meet
constexpr std::size_t hashDigits = 16;
constexpr const char* promiseGroup = "Promise";

std::string longPromiseNameFor(std::string_view logicalName) {
  std::uint64_t hash = 0xcbf29ce484222325u;  // FNV-1a, 64 bits
  for (const char c : logicalName) hash = (hash ^ static_cast<unsigned char>(c)) * 0x100000001b3u;
  char digits[hashDigits + 1];
  std::snprintf(digits, sizeof digits, "%016llx", static_cast<unsigned long long>(hash));
  std::string name(1, '.');
  name += digits;
  name += longSuffix;
  return name;
}

bool isLongPromiseName(std::string_view name) {
  return name.size() == 1 + hashDigits + longSuffix.size() && name.front() == '.' && name.ends_with(longSuffix) &&
         name.substr(1, hashDigits).find_first_not_of("0123456789abcdef") == std::string_view::npos;
}

// A promise can stand for one item of its own folder only.
bool isPlainName(std::string_view name) {
  return !name.empty() && name != "." && name != ".." && name.find('/') == std::string_view::npos &&
         name.find('\0') == std::string_view::npos;
}

std::string lastComponent(const std::string& path) { return path.substr(path.rfind('/') + 1); }
std::string folderWithSlash(const std::string& path) { return path.substr(0, path.rfind('/') + 1); }

template <typename T>
std::optional<T> integer(const std::optional<std::string>& text) {
  T value = 0;
  if (!text || text->empty()) return std::nullopt;
  const auto [end, failure] = std::from_chars(text->data(), text->data() + text->size(), value);
  if (failure != std::errc() || end != text->data() + text->size()) return std::nullopt;
  return value;
}

std::optional<Date> date(const std::optional<std::string>& text) {
  if (!text || text->empty()) return std::nullopt;
  char* end = nullptr;
  const double seconds = g_ascii_strtod(text->c_str(), &end);
  // Beyond this a date does not fit into the clock's nanoseconds.
  if (end != text->c_str() + text->size() || !std::isfinite(seconds) || std::fabs(seconds) > 9e9) return std::nullopt;
  return Date(std::chrono::round<std::chrono::microseconds>(std::chrono::duration<double>(seconds)));
}

std::string text(Date moment) {
  using namespace std::chrono;
  const auto whole = floor<seconds>(moment);
  const auto microseconds = duration_cast<std::chrono::microseconds>(moment - whole).count();
  char fraction[16];
  std::snprintf(fraction, sizeof fraction, ".%06d", static_cast<int>(microseconds));
  return std::to_string(whole.time_since_epoch().count()) + (microseconds ? fraction : "");
}

}  // namespace

std::string promiseNameFor(std::string_view logicalName) {
  std::string name = "." + std::string(logicalName) + std::string(shortSuffix);
  return name.size() <= nameLimit ? name : longPromiseNameFor(logicalName);
}

std::string promisePathFor(const std::string& logicalPath) {
  return folderWithSlash(logicalPath) + promiseNameFor(lastComponent(logicalPath));
}

bool isPromiseName(std::string_view name) { return isLongPromiseName(name) || logicalNameOfShortPromise(name); }

std::optional<std::string> logicalNameOfShortPromise(std::string_view name) {
  if (name.size() <= 1 + shortSuffix.size() || name.front() != '.' || !name.ends_with(shortSuffix)) return std::nullopt;
  const std::string_view logical = name.substr(1, name.size() - 1 - shortSuffix.size());
  if (!isPlainName(logical)) return std::nullopt;
  return std::string(logical);
}

std::optional<std::string> logicalNameOf(const std::string& promisePath) {
  const std::string name = lastComponent(promisePath);
  if (const auto logical = logicalNameOfShortPromise(name)) return folderWithSlash(promisePath) + *logical;
  if (!isLongPromiseName(name)) return std::nullopt;
  const Result<PromiseInfo> info = readPromise(promisePath);
  if (!info) return std::nullopt;
  return folderWithSlash(promisePath) + info.value->name;
}

std::optional<std::string> physicalPathOf(const std::string& path) {
  struct stat status = {};
  if (::lstat(path.c_str(), &status) == 0) return path;
  if (!isPlainName(lastComponent(path)) || isPromiseName(lastComponent(path))) return std::nullopt;
  std::string promise = promisePathFor(path);
  if (::lstat(promise.c_str(), &status) == 0 && S_ISREG(status.st_mode)) return promise;
  return std::nullopt;
}

Result<PromiseInfo> readPromise(const std::string& promisePath) {
  const std::string fileName = lastComponent(promisePath);
  if (!isPromiseName(fileName)) return fileError(FileErrorCode::ReadUnknown, promisePath, "the file is no promise");
  const Result<KeyFile> file = readKeyFile(promisePath);
  if (!file) return *file.error;
  GKeyFile* keys = file.value->get();
  const auto value = [keys](const char* key) { return keyFileBytes(keys, promiseGroup, key); };

  PromiseInfo info;
  if (const auto logical = logicalNameOfShortPromise(fileName)) {
    info.name = *logical;
  } else {
    info.name = value("Name").value_or("");
    // Otherwise nobody would find the promise by the name that it claims.
    if (!isPlainName(info.name) || longPromiseNameFor(info.name) != fileName) {
      return fileError(FileErrorCode::ReadUnknown, promisePath, "the promise names another item");
    }
  }
  info.size = integer<std::uint64_t>(value("Size")).value_or(0);
  info.modified = date(value("Modified"));
  info.created = date(value("Created"));
  info.package = keyFileBool(keys, promiseGroup, "Package", false);
  info.extensionHidden = keyFileBool(keys, promiseGroup, "ExtensionHidden", false);
  const std::optional<std::string> share = value("Share");
  if (share == SharedItemRoleOwner || share == SharedItemRoleParticipant) info.share = share;
  info.tags = keyFileList(keys, promiseGroup, "Tags").value_or(std::vector<std::string>());
  info.documentID = integer<std::int64_t>(value("DocumentID"));
  return info;
}

std::optional<Error> writePromise(const std::string& folder, const PromiseInfo& info) {
  const std::string path = folder + "/" + promiseNameFor(info.name);
  if (!isPlainName(info.name)) return fileError(FileErrorCode::WriteInvalidFileName, path, "not the name of an item");
  const KeyFile file(g_key_file_new());
  const auto set = [&file](const char* key, const std::string& value) {
    g_key_file_set_string(file.get(), promiseGroup, key, value.c_str());
  };
  set("Name", info.name);
  set("Size", std::to_string(info.size));
  if (info.modified) set("Modified", text(*info.modified));
  if (info.created) set("Created", text(*info.created));
  set("Package", info.package ? "true" : "false");
  if (info.extensionHidden) set("ExtensionHidden", "true");
  if (info.share) set("Share", *info.share);
  std::vector<const char*> tags;
  for (const std::string& tag : info.tags) tags.push_back(tag.c_str());
  if (!tags.empty()) g_key_file_set_string_list(file.get(), promiseGroup, "Tags", tags.data(), tags.size());
  if (info.documentID) set("DocumentID", std::to_string(*info.documentID));
  return writeSmallFile(path, keyFileText(file.get()));
}

std::optional<Error> setPromiseTags(const std::string& promisePath, const std::vector<std::string>& tags) {
  const Result<KeyFile> file = readKeyFile(promisePath);
  if (!file) return file.error;
  std::vector<const char*> texts;
  for (const std::string& tag : tags) texts.push_back(tag.c_str());
  if (texts.empty()) {
    g_key_file_remove_key(file.value->get(), promiseGroup, "Tags", nullptr);
  } else {
    g_key_file_set_string_list(file.value->get(), promiseGroup, "Tags", texts.data(), texts.size());
  }
  return writeSmallFile(promisePath, keyFileText(file.value->get()));
}

std::optional<Error> setPromiseDocumentID(const std::string& promisePath, std::int64_t documentID) {
  const Result<KeyFile> file = readKeyFile(promisePath);
  if (!file) return file.error;
  g_key_file_set_int64(file.value->get(), promiseGroup, "DocumentID", documentID);
  return writeSmallFile(promisePath, keyFileText(file.value->get()));
}

}  // namespace vaelo
