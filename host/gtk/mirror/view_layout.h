// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include "platform/ui/view.h"

namespace vaelo {

/// Gives every view below `root` that constraints place the frame that they, the stacks above it and its natural size ask
/// for; views with a frame of their own keep it. Right to left, leading edges are right ones. Lays out nothing and calls
/// setFrame alone. True when a frame changed. Main thread.
bool solveLayout(View& root, LayoutDirection direction);

}  // namespace vaelo
