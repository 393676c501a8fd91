// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/drive/item_attributes.h"

#include <glib.h>
#include <sys/xattr.h>

#include <algorithm>
#include <cerrno>
#include <sstream>

#include "host/drive/extended_attribute.h"
#include "host/drive/promise_file.h"
#include "host/drive/small_file.h"
#include "platform/resource_values.h"

namespace vaelo {

namespace {

std::optional<PromiseInfo> promiseAt(const std::string& physical) {
  if (!isPromiseName(physical.substr(physical.rfind('/') + 1))) return std::nullopt;
  return readPromise(physical).value;
}

std::string trimmed(const std::string& text) {
  constexpr const char* blanks = " \t\r\n";
  const std::size_t first = text.find_first_not_of(blanks);
  if (first == std::string::npos) return {};
  return text.substr(first, text.find_last_not_of(blanks) - first + 1);
}

}  // namespace

std::optional<std::string> sharedItemRoleAt(const std::string& physical) {
  if (const auto promise = promiseAt(physical)) return promise->share;
  std::optional<std::string> role = extendedAttribute(physical, "user.vaelo.share");
  if (role != SharedItemRoleOwner && role != SharedItemRoleParticipant) return std::nullopt;
  return role;
}

bool extensionIsHiddenAt(const std::string& physical) {
  if (const auto promise = promiseAt(physical)) return promise->extensionHidden;
  return extendedAttribute(physical, "user.vaelo.hidden-extension") == "true";
}

namespace {

/// As they are kept, whatever they are.
std::vector<std::string> keptTagsAt(const std::string& physical) {
  if (const auto promise = promiseAt(physical)) return promise->tags;
  std::vector<std::string> kept;
  std::istringstream stream(extendedAttribute(physical, TagsAttribute).value_or(""));
  for (std::string tag; std::getline(stream, tag, ',');) kept.push_back(tag);
  return kept;
}

}  // namespace

bool isTagName(const std::string& name) {
  if (name.empty() || name != trimmed(name) || name.find(',') != std::string::npos) return false;
  if (!g_utf8_validate(name.data(), static_cast<gssize>(name.size()), nullptr)) return false;
  if (static_cast<std::size_t>(g_utf8_strlen(name.c_str(), -1)) > LongestTagName) return false;
  for (const char* c = name.c_str(); *c; c = g_utf8_next_char(c)) {
    if (g_unichar_iscntrl(g_utf8_get_char(c))) return false;
  }
  return true;
}

std::optional<Error> setTagAt(const std::string& physical, const std::string& name, bool on) {
  // One that is there already may be taken off, whatever it is called.
  if (on && !isTagName(name)) return fileError(FileErrorCode::WriteInvalidFileName, physical, "no name for a tag");
  std::vector<std::string> tags = keptTagsAt(physical);
  const auto isIt = [&name](const std::string& tag) { return trimmed(tag) == name; };
  const bool isOn = std::any_of(tags.begin(), tags.end(), isIt);
  if (isOn == on) return std::nullopt;
  if (on) {
    tags.push_back(name);
  } else {
    std::erase_if(tags, isIt);
  }
  if (isPromiseName(physical.substr(physical.rfind('/') + 1))) return setPromiseTags(physical, tags);
  std::string text;
  for (const std::string& tag : tags) text += (text.empty() ? "" : ",") + tag;
  const int status = text.empty() ? ::lremovexattr(physical.c_str(), TagsAttribute)
                                  : ::lsetxattr(physical.c_str(), TagsAttribute, text.data(), text.size(), 0);
  if (status == 0 || (text.empty() && errno == ENODATA)) return std::nullopt;
  return errorFromErrno(errno, physical, FileAccess::Write);
}

std::vector<std::string> tagNamesAt(const std::string& physical) {
  const std::vector<std::string> kept = keptTagsAt(physical);
  std::vector<std::string> names;
  for (const std::string& tag : kept) {
    std::string name = trimmed(tag);
    const bool readable = !name.empty() && g_utf8_validate(name.data(), static_cast<gssize>(name.size()), nullptr);
    if (readable && std::find(names.begin(), names.end(), name) == names.end()) names.push_back(std::move(name));
  }
  return names;
}

}  // namespace vaelo
