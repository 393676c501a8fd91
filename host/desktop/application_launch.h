// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <gio/gio.h>

#include <functional>
#include <string>
#include <vector>

namespace vaelo {

/// Called at most once with the reason, for a person, when an application could not be started.
using LaunchFailed = std::function<void(const std::string& reason)>;

/// Where a finger would find nothing to touch, if the desktop has a terminal at all. Any thread.
bool needsTerminal(GAppInfo* app);

/// Starts the application on URIs. False when it can't be started, which `failed` was told before. An application that the
/// desktop starts over the session bus may fail later; `failed` hears of it then. Main thread.
bool launchApplication(GAppInfo* app, const std::vector<std::string>& uris, GAppLaunchContext* context, LaunchFailed failed);

/// Starts a program with arguments. As above; `name` is what the desktop's start notice calls it.
bool launchProgram(const std::vector<std::string>& arguments, const std::string& name, GAppLaunchContext* context,
                   LaunchFailed failed);

}  // namespace vaelo
