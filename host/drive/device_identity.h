// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <string>

#include "host/drive/drive_layout.h"
#include "platform/logging.h"

namespace vaelo {

/// What other devices on the drive know this one by.
struct DeviceIdentity {
  std::string id;    ///< hexadecimal, for file names; stays with the data folder
  std::string name;  ///< for a person
};

/// Reads device.ini in the data folder, and makes it when there is none ([Device] ID=, and Name= when the user wants another
/// than the host's). Where that fails the identity is that of this run alone, and the log tells. Blocks; any thread.
DeviceIdentity deviceIdentity(const DriveLayout& layout, LogSink& log);

/// True for what may stand for a device in a file name: 1 to 64 letters, digits and hyphens.
bool isDeviceID(const std::string& text);

}  // namespace vaelo
