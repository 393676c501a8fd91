// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <optional>
#include <string>

#include "host/drive/small_file.h"

namespace vaelo {

/// Loads a key file; an absent one is empty, and so is one that can't be read or is damaged, which is kept aside as
/// PATH.damaged-N: the next save must not be what destroys it.
KeyFile loadKeyFile(const std::string& path);
/// Writes it whole or not at all: a temporary name, flushed, renamed. Folders above are made. Blocks.
/// Errors: those of FileManager; 512 for more than readKeyFile reads.
std::optional<Error> saveKeyFile(const std::string& path, GKeyFile* file);

}  // namespace vaelo
