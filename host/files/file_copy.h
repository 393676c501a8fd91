// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <optional>
#include <string>

#include "platform/error.h"

namespace vaelo {

/// Moves between file systems: copies to a temporary name beside `to`, flushes, renames without replacing, and only then
/// removes `from`. On failure the source is whole and nothing is left at the destination. Attributes and times come along.
std::optional<Error> copyThenRemove(const std::string& from, const std::string& to);

/// Gives the item that the promise at `promise` stands for the logical path `to`, without replacing.
std::optional<Error> movePromise(const std::string& promise, const std::string& to);

}  // namespace vaelo
