// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <gio/gio.h>

#include <string>

#include "host/desktop/application_launch.h"

namespace vaelo {

/// Hands a file to the desktop's own dialog for sending by Bluetooth. Main thread.
class BluetoothSender {
 public:
  /// Whether the desktop has such a dialog.
  static bool isAvailable();
  /// False when it could not be started, which `failed` was told before.
  static bool send(const std::string& path, GAppLaunchContext* context, LaunchFailed failed);
};

}  // namespace vaelo
