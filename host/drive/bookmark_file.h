// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <string>
#include <string_view>

#include "platform/result.h"

namespace vaelo {

/// A bookmark stands in the drive for a document outside it: a regular file NAME.vaelobookmark with a file URL in it.
/// Safe from any thread.

/// Looks at the name alone.
bool isBookmarkName(std::string_view name);
/// The URL that a bookmark file holds, whether or not something is there. Reads at most 64 KiB and follows no final link.
/// Errors: 260 no such file, 257 no permission, 256 for a file that is damaged, too large, no regular file, or whose URL is
/// of another scheme or host, relative, wrongly encoded or holds a NUL.
Result<URL> readBookmarkFile(const std::string& path);
/// Writes (atomically, replacing) a bookmark at `path` to `target`. Errors: those of FileManager.
std::optional<Error> writeBookmarkFile(const std::string& path, const URL& target);

}  // namespace vaelo
