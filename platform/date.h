// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <chrono>

namespace vaelo {

/// A moment of the wall clock.
using Date = std::chrono::system_clock::time_point;

}  // namespace vaelo
