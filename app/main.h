// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

namespace vaelo {

/// Logs what is started and runs the platform's application loop with an AppDelegate; the loop's exit status. The platform
/// is installed. Main thread.
int vaeloMain(int argc, char** argv);

}  // namespace vaelo
