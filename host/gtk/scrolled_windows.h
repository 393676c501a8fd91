// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

namespace vaelo {

/// The toolkit's scrolled windows leave a handler with its settings each time they are shown, which would be called for a
/// widget that is gone when the user changes how scroll bars look; from now on they take it back. Main thread, once.
void mendScrolledWindows();

}  // namespace vaelo
