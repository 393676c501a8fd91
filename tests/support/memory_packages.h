// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <algorithm>
#include <cctype>

#include "platform/url.h"

namespace vaelo {

/// True when a folder of that name is a package.
inline bool isMemoryPackage(const URL& url) {
  std::string extension = url.pathExtension();
  std::transform(extension.begin(), extension.end(), extension.begin(),
                 [](unsigned char c) { return static_cast<char>(std::tolower(c)); });
  for (const char* known : {"bundle", "rtfd", "textbundle", "sketchbundle", "vlopackage"}) {
    if (extension == known) return true;
  }
  return false;
}

}  // namespace vaelo
