// SPDX-License-Identifier: GPL-3.0-or-later
#include "platform/platform.h"

#include <cstdlib>

namespace vaelo {

namespace {
Platform* installed = nullptr;
}

Platform& Platform::current() {
  if (!installed) std::abort();
  return *installed;
}

void Platform::install(Platform* platform) { installed = platform; }

}  // namespace vaelo
