// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

namespace vaelo {

/// Tells the toolkit to draw without GL where the machine has no graphics device: GL would then be emulated by the
/// processor, which takes 40 ms more to start and draws no faster. What the environment says already (GDK_DEBUG,
/// GSK_RENDERER) stands. Before the toolkit is initialised; main thread.
void drawWithoutGLWhereItIsEmulated();

}  // namespace vaelo
