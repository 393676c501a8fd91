// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

namespace vaelo {

/// The least width and height of what a finger is to meet, in logical pixels.
inline constexpr int TouchSize = 44;

}  // namespace vaelo
