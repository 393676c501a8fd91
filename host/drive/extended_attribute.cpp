// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/drive/extended_attribute.h"

#include <sys/xattr.h>

#include <cerrno>

namespace vaelo {

namespace {

// Most items carry none and most values are short, so one call answers nearly always.
template <typename Get>
std::optional<std::string> attribute(const Get& get) {
  std::string value(256, '\0');
  ssize_t length = get(value.data(), value.size());
  if (length < 0 && errno == ERANGE) {
    value.resize(64 * 1024);  // the most that the kernel stores
    length = get(value.data(), value.size());
  }
  if (length < 0) return std::nullopt;
  value.resize(static_cast<std::size_t>(length));
  return value;
}

}  // namespace

std::optional<std::string> extendedAttribute(const std::string& path, const char* name) {
  return attribute([&](void* to, std::size_t size) { return ::lgetxattr(path.c_str(), name, to, size); });
}

std::optional<std::string> extendedAttribute(int openFile, const char* name) {
  return attribute([&](void* to, std::size_t size) { return ::fgetxattr(openFile, name, to, size); });
}

}  // namespace vaelo
