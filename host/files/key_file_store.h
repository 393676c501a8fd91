// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <optional>
#include <string>

#include "host/support/glib_ptr.h"
#include "platform/error.h"

namespace vaelo {

/// Loads a key file; an absent one is empty, and so is a damaged one, which is kept aside as PATH.damaged.
GKeyFilePtr loadKeyFile(const std::string& path);
/// Writes it whole or not at all: a temporary name, flushed, renamed. Folders above are made. Blocks.
std::optional<Error> saveKeyFile(const std::string& path, GKeyFile* file);

}  // namespace vaelo
