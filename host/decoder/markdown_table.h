// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <string>
#include <string_view>
#include <vector>

namespace vaelo {

/// The lines of a table as text in columns, for letters of one width; empty when they are none.
std::string markdownTable(const std::vector<std::string_view>& lines);

}  // namespace vaelo
