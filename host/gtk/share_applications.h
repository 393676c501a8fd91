// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <gtk/gtk.h>

#include <functional>
#include <string>

namespace vaelo {

/// Lets the user choose among all installed applications that take files, in a window of its own. `chosen` is called at most
/// once, after the window went. Main thread.
void chooseApplicationFor(const std::string& itemName, GtkWindow* over, std::function<void(GAppInfo*)> chosen);

}  // namespace vaelo
