// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <glib-object.h>

#include <memory>
#include <string>

namespace vaelo {

struct GObjectUnref {
  void operator()(void* object) const { g_object_unref(object); }
};
/// Owns one reference of a GObject.
template <typename T>
using GRef = std::unique_ptr<T, GObjectUnref>;

struct GErrorFree {
  void operator()(GError* error) const { g_error_free(error); }
};
using GErrorPtr = std::unique_ptr<GError, GErrorFree>;

/// Takes over a string that g_free frees; empty for null.
inline std::string takeString(char* text) {
  std::string result = text ? text : "";
  g_free(text);
  return result;
}

}  // namespace vaelo
