// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

namespace vaelo {

/// Adds rules in CSS to the application's look. Each text is added once, and nothing without a display. Main thread.
void addStyle(const char* rules);

}  // namespace vaelo
