// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <string>

#include "host/drive/small_file.h"
#include "platform/error.h"

namespace vaelo {

/// errorFromErrno with words for a person, which name the item: what the user's own files fail with reaches an alert, what
/// the drive's files fail with only the log.
Error describedError(int number, const std::string& path, FileAccess access);

}  // namespace vaelo
