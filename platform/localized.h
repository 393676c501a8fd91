// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <string>

#include "platform/platform.h"

namespace vaelo {

/// The text for `key` in the user's language, of the platform that is installed. Main thread or any other.
inline std::string localized(const char* key) { return Platform::current().formatting.localizedString(key); }

}  // namespace vaelo
