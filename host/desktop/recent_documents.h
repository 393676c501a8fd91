// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <functional>
#include <optional>

#include "platform/url.h"

namespace vaelo {

/// The desktop's list of recent documents, which other programs read and write too. Main thread.

/// Puts the document at the head of the list, when the main loop has nothing better to do.
void noteRecentDocument(const URL& document);
/// The document used last among those that `counts` says yes to; nothing for none.
std::optional<URL> latestRecentDocument(const std::function<bool(const URL&)>& counts);

}  // namespace vaelo
