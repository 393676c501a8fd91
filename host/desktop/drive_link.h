// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <optional>
#include <string>

#include "platform/url.h"

namespace vaelo {

/// The link of our own scheme that leads to the item; nothing for a path that is not UTF-8, which no link can name. Any
/// thread.
std::optional<std::string> driveLinkTo(const URL& item);

}  // namespace vaelo
