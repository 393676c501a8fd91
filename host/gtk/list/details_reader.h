// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <memory>
#include <string>

#include "host/gtk/list/folder_item.h"

namespace vaelo {

/// Reads what a row shows besides its name: size and date, a folder's item count, what a promise tells, and the cached
/// thumbnail, at most `thumbnailPixels` wide and high. Never opens a document. Blocks; any thread.
std::shared_ptr<const ItemDetails> readDetails(const std::string& path, EntryKind kind, int thumbnailPixels);

}  // namespace vaelo
