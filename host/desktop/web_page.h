// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <gio/gio.h>

#include <functional>
#include <string>

namespace vaelo {

/// Opens a page of the web in the user's browser, without waiting for it. `failed` is called at most once, later, with the
/// reason. Main thread.
void openWebPage(const std::string& address, GAppLaunchContext* context, std::function<void(const std::string&)> failed);

}  // namespace vaelo
