// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/drive/item_attributes.h"

#include <glib.h>

#include <algorithm>
#include <sstream>

#include "host/drive/extended_attribute.h"
#include "host/drive/promise_file.h"
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

std::vector<std::string> tagNamesAt(const std::string& physical) {
  std::vector<std::string> kept;
  if (const auto promise = promiseAt(physical)) {
    kept = promise->tags;
  } else {
    std::istringstream stream(extendedAttribute(physical, "user.xdg.tags").value_or(""));
    for (std::string tag; std::getline(stream, tag, ',');) kept.push_back(tag);
  }
  std::vector<std::string> names;
  for (const std::string& tag : kept) {
    std::string name = trimmed(tag);
    const bool readable = !name.empty() && g_utf8_validate(name.data(), static_cast<gssize>(name.size()), nullptr);
    if (readable && std::find(names.begin(), names.end(), name) == names.end()) names.push_back(std::move(name));
  }
  return names;
}

}  // namespace vaelo
