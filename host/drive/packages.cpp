// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/drive/packages.h"

#include <glib.h>

#include <string>

namespace vaelo {

bool isPackageName(std::string_view name) {
  const std::size_t dot = name.rfind('.');
  if (dot == std::string_view::npos || dot == 0) return false;
  const std::string extension(name.substr(dot + 1));
  for (const char* known : {"bundle", "rtfd", "textbundle", "sketchbundle", "vlopackage"}) {
    if (g_ascii_strcasecmp(extension.c_str(), known) == 0) return true;
  }
  return false;
}

}  // namespace vaelo
