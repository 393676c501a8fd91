// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <memory>
#include <string>

#include "platform/url.h"

namespace vaelo {

class GtkWindowHost;

/// Asks where a copy of the item is to go, and copies it there on a worker. A copy that takes longer than half a second
/// shows its progress and can be stopped; how it ended is told in the window. Lives on by itself; main thread.
void saveCopyOf(const URL& item, const std::string& name, const std::shared_ptr<GtkWindowHost>& window);

}  // namespace vaelo
