// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <optional>
#include <string>

namespace vaelo {

/// The bytes of an extended attribute; a final link is not followed. Nothing when it is not there or can't be read.
std::optional<std::string> extendedAttribute(const std::string& path, const char* name);
std::optional<std::string> extendedAttribute(int openFile, const char* name);

}  // namespace vaelo
