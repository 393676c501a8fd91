// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <string>

#include "platform/result.h"

namespace vaelo {

/// The text of the synced values (GVariant's text format, a{sv}; empty for none) with a tag added to the user's tags; the
/// same text when there is one of that name. All else that the text says stays. Error 256 for a text that is none, 3328 for
/// tags of another version or form than this program knows.
Result<std::string> valuesWithTag(const std::string& text, const std::string& name, unsigned label);

}  // namespace vaelo
