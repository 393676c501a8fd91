// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <adwaita.h>

#include <functional>
#include <string>

namespace vaelo {

/// What the application exports on the session bus beside GApplication's own objects.
struct BusExports {
  /// Called before the application's name is on the bus, so that no caller comes too early. False with `error` set ends the
  /// start.
  std::function<bool(GDBusConnection* bus, const std::string& objectPath, GError** error)> add;
  std::function<void()> remove;
};

/// Makes the application object; the caller owns the reference. Main thread.
AdwApplication* makeDriveApplication(const char* identifier, GApplicationFlags flags, BusExports exports);

}  // namespace vaelo
