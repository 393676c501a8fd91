// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include "platform/url.h"

namespace vaelo {

/// Where the drive in memory is.
inline const URL Mirror("/drive/mirror", true);
inline const URL Drive("/drive/mirror/com~marrow~Kestrel", true);
inline const std::string DrivePath = Drive.path();
inline constexpr const char* DriveIdentifier = "com~marrow~Kestrel";

}  // namespace vaelo
