// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <string>
#include <string_view>

#include "platform/result.h"

namespace vaelo {

/// An alias is a desktop entry of the type Link, NAME.desktop, whose URL names a file or folder. Safe from any thread.

/// Looks at the name alone: what has it may still be an entry of another type, which readAliasFile tells.
bool isAliasName(std::string_view name);
/// The URL that an alias file holds, whether or not something is there. Reads at most 64 KiB and follows no final link.
/// Errors: 260 no such file, 257 no permission, 256 for a file that is no alias, damaged, too large, no regular file, or
/// whose URL is of another scheme or host, relative, wrongly encoded or holds a NUL.
Result<URL> readAliasFile(const std::string& path);

}  // namespace vaelo
