// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <string>

#include "platform/error.h"

namespace vaelo {

/// The error for a failed system call: code and words by `number` (errno), the path in the user information. `writing` tells
/// reads from changes, whose codes differ. The one place where system errors become ours.
Error errorFromErrno(int number, const std::string& path, bool writing);

}  // namespace vaelo
